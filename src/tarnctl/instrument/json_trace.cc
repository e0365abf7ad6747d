// The call trace as JSON lines (TARN_TRACE_FORMAT=json), a record a line:
//
//   {"event":"open","pid":P,"program":"orvocfg-vswitch","arguments":["-A","pg1","vs1"],
//    "time":"2026-01-02T03:04:05.678Z","host":"/path/host.db"}
//   {"event":"call","pid":P,"operation":"AddPortGroup","arguments":"\"pg1\"","on":"vs1",
//    "outcome":"ok"}                      (or "refused" with "message", or "fault"
//                                          with "fault" and "message")
//   {"event":"end","pid":P,"status":0,"outcome":"committed"}   (or "rolled back")
//
// A call's record is written when it ends, so a call made inside another
// comes before it; its arguments are the text trace's. A run that is killed
// has no end record (and changed nothing). Strings are UTF-8; a byte that
// is not is written as U+FFFD.
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <ctime>

#include "tarnctl/instrument/trace.h"

namespace TarnCtl::Instrument {

void WatchExit();

namespace {

struct Run {
  pid_t pid = 0;
  bool noted = false;    // the host was opened
  bool written = false;  // its open record is in the trace
  bool ended = false;    // its end record is in the trace
  bool committed = true;
  std::string open;  // the open record, until it is written
};

Run& ThisRun() {
  static Run run;
  if (run.pid != getpid()) {  // a forked child is a run of its own
    run = Run();
    run.pid = getpid();
  }
  return run;
}

// The length of the UTF-8 sequence at `text[at]`, or 0 when it is not one.
size_t Utf8Length(std::string_view text, size_t at) {
  const auto byte = [&](size_t i) { return static_cast<unsigned char>(text[i]); };
  const unsigned char lead = byte(at);
  size_t length = lead < 0xc2 ? 0 : lead < 0xe0 ? 2 : lead < 0xf0 ? 3 : lead < 0xf5 ? 4 : 0;
  if (length == 0 || at + length > text.size()) return 0;
  for (size_t i = 1; i < length; ++i) {
    if ((byte(at + i) & 0xc0) != 0x80) return 0;
  }
  const unsigned char second = byte(at + 1);
  if ((lead == 0xe0 && second < 0xa0) || (lead == 0xed && second >= 0xa0) ||
      (lead == 0xf0 && second < 0x90) || (lead == 0xf4 && second >= 0x90)) {
    return 0;  // overlong, a surrogate, or beyond U+10FFFF
  }
  return length;
}

void AppendJson(std::string& out, std::string_view text) {
  out += '"';
  for (size_t at = 0; at < text.size(); ++at) {
    const char c = text[at];
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      out += '\\';
      out += c;
    } else if (byte < 0x20 || byte == 0x7f) {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\u%04x", byte);
      out += escaped;
    } else if (byte < 0x80) {
      out += c;
    } else if (const size_t length = Utf8Length(text, at)) {
      out.append(text.substr(at, length));
      at += length - 1;
    } else {
      out += "\\ufffd";
    }
  }
  out += '"';
}

void Start(std::string& out, const char* event) {
  out += "{\"event\":\"";
  out += event;
  out += "\",\"pid\":";
  out += std::to_string(getpid());
}

// The program's name and arguments, as the kernel keeps them.
std::vector<std::string> CommandLine() {
  std::vector<std::string> words;
  const int fd = open("/proc/self/cmdline", O_RDONLY | O_CLOEXEC);
  if (fd < 0) return words;
  std::string text;
  char buffer[4096];
  ssize_t got;
  while ((got = read(fd, buffer, sizeof buffer)) > 0) text.append(buffer, static_cast<size_t>(got));
  close(fd);
  for (size_t start = 0; start < text.size();) {
    const size_t end = text.find('\0', start);
    words.push_back(text.substr(start, end == std::string::npos ? end : end - start));
    if (end == std::string::npos) break;
    start = end + 1;
  }
  return words;
}

std::string Now() {
  timespec now{};
  clock_gettime(CLOCK_REALTIME, &now);
  tm utc{};
  gmtime_r(&now.tv_sec, &utc);
  char text[40];
  const size_t length = std::strftime(text, sizeof text, "%Y-%m-%dT%H:%M:%S", &utc);
  std::snprintf(text + length, sizeof text - length, ".%03ldZ", now.tv_nsec / 1000000);
  return text;
}

// Writes the open record of the run, once.
void WriteOpen(Run& run) {
  if (!run.noted || run.written) return;
  run.written = true;
  WriteTraceLine(run.open);
  run.open.clear();
}

void WriteEnd(Run& run, int status) {
  if (!run.written || run.ended || !TraceJson()) return;
  run.ended = true;
  std::string line;
  Start(line, "end");
  line += ",\"status\":" + std::to_string(status);
  line += run.committed ? ",\"outcome\":\"committed\"}" : ",\"outcome\":\"rolled back\"}";
  WriteTraceLine(line);
}

}  // namespace

void WatchExit() {
  static const bool watching = [] {
    // Runs after the handler that commits a session left open at exit,
    // which is registered later.
    on_exit([](int status, void*) { WriteEnd(ThisRun(), status); }, nullptr);
    return true;
  }();
  (void)watching;
}

void TraceRunOpened(const std::string& host) {
  if (!TraceJson()) return;
  Run& run = ThisRun();
  if (run.noted) return;
  run.noted = true;
  std::string& line = run.open;
  Start(line, "open");
  const auto words = CommandLine();
  line += ",\"program\":";
  const std::string program = words.empty() ? "" : words[0].substr(words[0].rfind('/') + 1);
  AppendJson(line, program);
  line += ",\"arguments\":[";
  for (size_t i = 1; i < words.size(); ++i) {
    if (i > 1) line += ',';
    AppendJson(line, words[i]);
  }
  line += "],\"time\":\"" + Now() + "\",\"host\":";
  AppendJson(line, host);
  line += '}';
}

void TraceRunEnded(bool committed, bool changed) {
  if (!TraceJson()) return;
  Run& run = ThisRun();
  run.committed = committed;
  if (changed) WriteOpen(run);
}

void TraceRunExit(int status) {
  WriteEnd(ThisRun(), status);
}

void TraceCallRecord(std::string_view record, const char* operation, const std::string& args,
                     std::string_view on, const CallOutcome& outcome) {
  if (!TraceJson()) return;
  WriteOpen(ThisRun());
  std::string line;
  line.reserve(96 + args.size());
  Start(line, "call");
  line += ",\"operation\":\"";
  if (!record.empty()) line.append(record).append("::");
  line += operation;  // names of the registry: letters, digits and '_'
  line += "\",\"arguments\":";
  AppendJson(line, args);
  line += ",\"on\":";
  if (on.empty()) {
    line += "null";
  } else {
    AppendJson(line, on);
  }
  switch (outcome.kind) {
    case CallOutcome::Kind::kOk:
      line += ",\"outcome\":\"ok\"";
      break;
    case CallOutcome::Kind::kRefused:
      line += ",\"outcome\":\"refused\"";
      break;
    case CallOutcome::Kind::kFault:
      line += ",\"outcome\":\"fault\"";
      break;
  }
  if (outcome.fault != 0) line += ",\"fault\":" + std::to_string(outcome.fault);
  if (outcome.kind != CallOutcome::Kind::kOk) {
    line += ",\"message\":";
    if (outcome.message != nullptr) {
      AppendJson(line, *outcome.message);
    } else {
      line += "null";
    }
  }
  line += '}';
  WriteTraceLine(line);
}

}  // namespace TarnCtl::Instrument
