#include "tarnctl/instrument/trace.h"

#include <fcntl.h>
#include <signal.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>

#include "tarnctl/instrument/nodi_list.h"
#include "tarnctl/store/teaming_fields.h"

namespace TarnCtl::Instrument {

// Writes the end record of a JSON trace's run when the process exits
// (json_trace.cc).
void WatchExit();

namespace {

// The fields of a record in braces, in the order a visitor meets them.
class BraceWriter {
 public:
  explicit BraceWriter(std::string& line) : line_(line) {}

  template <typename T>
  void Number(const char*, const T& value) {
    Separate();
    AppendArg(line_, value);
  }
  void Names(const char*, const std::vector<std::string>& names) {
    Separate();
    AppendArg(line_, names);
  }
  template <typename Inside>
  void Group(const char*, Inside inside) {
    Separate();
    line_ += '{';
    BraceWriter writer(line_);
    inside(writer);
    line_ += '}';
  }

 private:
  void Separate() {
    if (!first_) line_ += ", ";
    first_ = false;
  }

  std::string& line_;
  bool first_ = true;
};

// Items in brackets, each written as an argument is.
template <typename Items>
void AppendList(std::string& line, const Items& items) {
  line += '[';
  for (size_t i = 0; i < items.size(); ++i) {
    if (i > 0) line += ", ";
    AppendArg(line, items[i]);
  }
  line += ']';
}

// The trace file of this process.
struct TraceFile {
  bool configured = false;
  std::string path;  // "" when off
  int fd = -1;
  bool broken = false;  // could not be opened or written: off
  // The file ends inside a line (a write cut short, on a full disk, say):
  // the next line starts on a line of its own.
  bool torn = false;
  bool json = false;  // JSON lines (json_trace.cc)
};

// Whether the file at `path`, open for appending as `fd`, ends inside a
// line.
bool EndsTorn(int fd, const char* path) {
  struct stat info;
  if (fstat(fd, &info) != 0 || !S_ISREG(info.st_mode) || info.st_size == 0) return false;
  const int reader = open(path, O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
  if (reader < 0) return false;
  char last = '\n';
  const bool torn = pread(reader, &last, 1, info.st_size - 1) == 1 && last != '\n';
  close(reader);
  return torn;
}

TraceFile& File() {
  static TraceFile file;
  return file;
}

void TurnOff(TraceFile& file, const char* what) {
  std::fprintf(stderr, "Call trace %s: cannot %s it (%s); calls are not traced\n",
               file.path.c_str(), what, std::strerror(errno));
  if (file.fd >= 0) close(file.fd);
  file.fd = -1;
  file.broken = true;
}

}  // namespace

void AppendEscaped(std::string& line, const std::string& text) {
  for (const char c : text) {
    const auto byte = static_cast<unsigned char>(c);
    if (c == '"' || c == '\\') {
      line += '\\';
      line += c;
    } else if (c == '\n') {
      line += "\\n";
    } else if (c == '\t') {
      line += "\\t";
    } else if (byte < 0x20 || byte == 0x7f) {
      char escaped[8];
      std::snprintf(escaped, sizeof escaped, "\\x%02x", byte);
      line += escaped;
    } else {
      line += c;
    }
  }
}

void AppendArg(std::string& line, const std::string& value) {
  line += '"';
  AppendEscaped(line, value);
  line += '"';
}

void AppendArg(std::string& line, const char* value) {
  AppendArg(line, std::string(value != nullptr ? value : ""));
}

void AppendArg(std::string& line, bool value) {
  line += value ? "true" : "false";
}

void AppendArg(std::string& line, int64_t value) {
  line += std::to_string(value);
}

void AppendArg(std::string& line, uint64_t value) {
  line += std::to_string(value);
}

void AppendArg(std::string& line, Out) {
  line += "out";
}

void AppendArg(std::string& line, const NODI_ParamList* list) {
  if (list == nullptr) {
    line += "null";
    return;
  }
  AppendList(line, list->values);
}

void AppendArg(std::string& line, const std::vector<std::string>& values) {
  AppendList(line, values);
}

void AppendArg(std::string& line, const HostCtl::Network::NicTeamingPolicy& policy) {
  line += '{';
  BraceWriter writer(line);
  Store::VisitTeamingFields(policy, writer);
  line += '}';
}

void AppendArg(std::string& line, const HostCtl::Network::DVPortParam& param) {
  line += '{' + FormatArgs(param.switchId, param.portId, param.connectionId) + '}';
}

void AppendArg(std::string& line, const HostCtl::Network::PortSecurityPolicy& policy) {
  line += '{' +
          FormatArgs(policy.allowPromiscuous, policy.allowMacChanges, policy.allowForgedTransmits) +
          '}';
}

void AppendArg(std::string& line, const HostCtl::Network::ShapingPolicy& policy) {
  line +=
      '{' +
      FormatArgs(policy.enabled, policy.averageBandwidth, policy.peakBandwidth, policy.burstSize) +
      '}';
}

void AppendArg(std::string& line, const HostCtl::Network::NicCapabilities& capabilities) {
  line += '{' + FormatArgs(capabilities.offloadBits, capabilities.reserved) + '}';
}

void ConfigureTrace(const char* path, const char* format) {
  TraceFile& file = File();
  const std::string wanted = path != nullptr ? path : "";
  file.configured = true;
  file.json = format != nullptr && std::strcmp(format, "json") == 0;
  if (file.json) WatchExit();
  if (wanted == file.path) return;
  if (file.fd >= 0) close(file.fd);
  file = TraceFile{true, wanted, -1, false, false, file.json};
  if (wanted.empty()) return;
  file.fd = open(path, O_WRONLY | O_CREAT | O_APPEND | O_CLOEXEC | O_NOCTTY | O_NONBLOCK, 0644);
  if (file.fd < 0) {
    TurnOff(file, "open");
    return;
  }
  file.torn = EndsTorn(file.fd, path);
}

bool TraceOn() {
  TraceFile& file = File();
  if (!file.configured) ConfigureTrace(std::getenv("TARN_TRACE"), std::getenv("TARN_TRACE_FORMAT"));
  return !file.path.empty() && !file.broken;
}

bool TraceJson() {
  return TraceOn() && File().json;
}

void WriteTraceLine(const std::string& line) {
  TraceFile& file = File();
  const std::string whole = (file.torn ? "\n" : "") + line + '\n';
  // A FIFO whose reader went away must not end the process: SIGPIPE is
  // held back around the write and taken back if the write raised it.
  sigset_t pipe, previous;
  sigemptyset(&pipe);
  sigaddset(&pipe, SIGPIPE);
  sigset_t pending;
  sigpending(&pending);
  const bool alreadyPending = sigismember(&pending, SIGPIPE) == 1;
  pthread_sigmask(SIG_BLOCK, &pipe, &previous);
  // One write keeps the line whole among concurrent writers.
  const ssize_t written = write(file.fd, whole.data(), whole.size());
  const int error = errno;
  if (written < 0 && error == EPIPE && !alreadyPending) {
    const timespec none{0, 0};
    sigtimedwait(&pipe, nullptr, &none);
  }
  pthread_sigmask(SIG_SETMASK, &previous, nullptr);
  if (written < 0) {
    errno = error;
    TurnOff(file, "write");
  } else if (static_cast<size_t>(written) < whole.size()) {
    // Cut short: the rest, or the reason it cannot be written. A line left
    // cut is ended by the next program that traces to this file.
    const size_t rest = whole.size() - static_cast<size_t>(written);
    errno = 0;
    if (write(file.fd, whole.data() + written, rest) == static_cast<ssize_t>(rest)) {
      file.torn = false;
      return;
    }
    if (errno == 0) errno = ENOSPC;
    TurnOff(file, "write");
  } else {
    file.torn = false;
  }
}

}  // namespace TarnCtl::Instrument
