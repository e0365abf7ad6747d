// The call trace.
//
// When TARN_TRACE names a file, every library operation appends one line to
// it when it is entered (so a call that fails is traced too):
//
//   Name(arg, arg, ...)            a static function, a node call, or an
//                                  operation of the switch information or
//                                  network information object
//   Name(arg, ...) on NAME         an operation on an object: a standard
//                                  switch (its name), a distributed or
//                                  opaque switch (its switch name), a port
//                                  group (its name), a DVPort (its port id)
//
// The four GetDefaultPolicy functions are traced with their record's name,
// e.g. "ShapingPolicy::GetDefaultPolicy()".
//
// Arguments, in the order of the call:
//   strings     in double quotes; \" \\ \n \t and other control bytes as
//               \xNN are escaped, other bytes are written as they are
//   bools       true / false
//   integers    decimal (8-bit ones too)
//   records     braces around every field in declaration order:
//               NicTeamingPolicy {16, 0, 0, {0, 0, 0, 0}, ["pnic0"], 1}
//               DVPortParam {"<switch id>", "100", 1700000000}
//               PortSecurityPolicy {false, false, false}
//               ShapingPolicy {false, 0, 0, 0}
//               NicCapabilities {0, 0}
//   vectors     brackets: ["pnic0", "pnic1"]
//   out-parameters (IsInUse's list, NODI_CheckSig's result places): out
//   a node parameter list: its values in brackets, [1]; a null one: null
// The NAME after " on " is escaped like a string, without the quotes: no
// name can make a line look like two.
//
// Each line is written with one write() on a descriptor opened with
// O_APPEND, so lines of concurrent processes never mix. The file is opened
// once per process (again only when TARN_TRACE names another file), without
// waiting (a FIFO with no reader is no reason to hang); a file that cannot
// be opened or written turns the trace off with one line on standard
// error.
#pragma once

#include <concepts>
#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

#include "hostctl/records.h"

struct NODI_ParamList;

namespace TarnCtl::Instrument {

// Stands for an out-parameter in a traced argument list.
struct Out {};

// Appends the trace form of one argument to `line`.
void AppendArg(std::string& line, const std::string& value);
void AppendArg(std::string& line, const char* value);
void AppendArg(std::string& line, bool value);
void AppendArg(std::string& line, int64_t value);
void AppendArg(std::string& line, uint64_t value);
void AppendArg(std::string& line, Out);
void AppendArg(std::string& line, const NODI_ParamList* list);
void AppendArg(std::string& line, const std::vector<std::string>& values);
void AppendArg(std::string& line, const HostCtl::Network::NicTeamingPolicy& policy);
void AppendArg(std::string& line, const HostCtl::Network::DVPortParam& param);
void AppendArg(std::string& line, const HostCtl::Network::PortSecurityPolicy& policy);
void AppendArg(std::string& line, const HostCtl::Network::ShapingPolicy& policy);
void AppendArg(std::string& line, const HostCtl::Network::NicCapabilities& capabilities);

template <std::signed_integral T>
requires(!std::same_as<T, bool>) void AppendArg(std::string& line, T value) {
  AppendArg(line, static_cast<int64_t>(value));
}
template <std::unsigned_integral T>
requires(!std::same_as<T, bool>) void AppendArg(std::string& line, T value) {
  AppendArg(line, static_cast<uint64_t>(value));
}

// `text` escaped as a traced string is, without the quotes.
void AppendEscaped(std::string& line, const std::string& text);

// The argument list of a call, without the parentheses: "10, true".
template <typename... Args>
std::string FormatArgs(const Args&... args) {
  std::string text;
  bool first = true;
  ((text += first ? "" : ", ", first = false, AppendArg(text, args)), ...);
  return text;
}

// Traces into the file `path` names from now on (null or empty: no trace),
// as JSON lines when `format` is "json", else as the text lines above. The
// library's edge calls it with TARN_TRACE and TARN_TRACE_FORMAT whenever it
// opens the host; a process that traces before that reads them once itself.
void ConfigureTrace(const char* path, const char* format = nullptr);
// True while the configured trace file can be written.
bool TraceOn();
// True when the trace is on and made of JSON lines (json_trace.cc).
bool TraceJson();
// Appends `line` and a newline to the trace file. REQUIRES: TraceOn().
void WriteTraceLine(const std::string& line);

// The JSON trace's records (json_trace.cc). All of them do nothing unless
// TraceJson().
//
// A run is a process's time with its host. Opening the host is noted; its
// record is written before the run's first other record: the first call's,
// or the end's of a run that changed the host without library calls (a
// tarnhost command). A run with an open record gets an end record when
// the process exits.
void TraceRunOpened(const std::string& host);
// The run's session ended: committed, or rolled back. `changed`: it
// changed the host (a run without calls is recorded only then).
void TraceRunEnded(bool committed, bool changed);
// Writes the end record now, for a process that ends without exit().
void TraceRunExit(int status);

// How a call ended: ok, refused with a message, or failed (or, for `pass`,
// slowed down) by the fault numbered `fault`.
struct CallOutcome {
  enum class Kind { kOk, kRefused, kFault } kind = Kind::kOk;
  const std::string* message = nullptr;  // none: unknown
  int64_t fault = 0;                     // 0: none
};
// The record of a call when it ends: `record` ("" or a record's name
// before "::"), the operation, its arguments as the text trace writes them,
// the object it was called on ("" for none), and its outcome.
void TraceCallRecord(std::string_view record, const char* operation, const std::string& args,
                     std::string_view on, const CallOutcome& outcome);

}  // namespace TarnCtl::Instrument
