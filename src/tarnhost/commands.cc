#include "tarnhost/commands.h"

#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <optional>
#include <string>
#include <type_traits>

#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "tarnctl/admin/host.h"
#include "tarnhost/args.h"

namespace TarnHost {
namespace {

using TarnCtl::Admin::Host;
using TarnCtl::Admin::Listing;

// Runs `body` on the host and commits what it did before the command
// succeeds: a commit that fails is then this command's failure ("tarnhost:
// ..." and status 1), not the session's end. Returns what `body` returns
// (0 for nothing).
template <typename Body>
auto OnHost(Body body) {
  Host host;
  if constexpr (std::is_void_v<decltype(body(host))>) {
    body(host);
    host.Commit();
    return 0;
  } else {
    auto result = body(host);
    host.Commit();
    return result;
  }
}

// The progress of a long load or dump on standard error when that is a
// terminal: one line that overwrites itself, ended by a newline when the
// object goes (before anything else is printed). A host done before its
// first report shows nothing.
class ProgressLine {
 public:
  explicit ProgressLine(const char* what) : what_(what) {}
  ~ProgressLine() {
    if (shown_) std::fputc('\n', stderr);
  }
  ProgressLine(const ProgressLine&) = delete;
  ProgressLine& operator=(const ProgressLine&) = delete;

  TarnCtl::Admin::Progress Report() {
    if (!isatty(STDERR_FILENO)) return nullptr;
    return [this](int64_t done, int64_t total) {
      if (!shown_ && total > 0 && done >= total) return;
      shown_ = true;
      if (total > 0) {
        std::fprintf(stderr, "\rtarnhost: %s %lld of %lld rows (%lld%%)", what_,
                     static_cast<long long>(done), static_cast<long long>(total),
                     static_cast<long long>(done * 100 / total));
      } else {
        std::fprintf(stderr, "\rtarnhost: %s %lld rows", what_, static_cast<long long>(done));
      }
      std::fflush(stderr);
    };
  }

 private:
  const char* what_;
  bool shown_ = false;
};

// The whole file, or standard input for "-"; any failure names the file.
std::string ReadFile(const std::string& path) {
  const bool standardInput = path == "-";
  std::FILE* file = standardInput ? stdin : std::fopen(path.c_str(), "rb");
  auto fail = [&] {
    const int error = errno;
    if (file && !standardInput) std::fclose(file);
    return HostCtl::Lib::HostCtlException(
        "cannot read " + (standardInput ? std::string("standard input") : path) + ": " +
            std::strerror(error),
        "");
  };
  if (!file) throw fail();
  std::string text;
  // A file's text in one allocation, with the room that lets a dump be
  // read in place (growing it as it comes touches twice its size).
  struct stat info;
  if (fstat(fileno(file), &info) == 0 && S_ISREG(info.st_mode)) {
    text.reserve(static_cast<size_t>(info.st_size) + TarnCtl::Admin::Host::kLoadRoom);
  }
  char buffer[65536];
  size_t n;
  while ((n = std::fread(buffer, 1, sizeof buffer, file)) > 0) text.append(buffer, n);
  if (std::ferror(file)) throw fail();
  if (!standardInput) std::fclose(file);
  return text;
}

}  // namespace

// A failed write is the host tool's own failure (exit status 1), reported
// like a refusal.
int Print(const std::string& text) {
  std::fwrite(text.data(), 1, text.size(), stdout);
  if (std::fflush(stdout) != 0 || std::ferror(stdout)) {
    throw HostCtl::Lib::HostCtlException(
        std::string("cannot write to standard output: ") + std::strerror(errno), "");
  }
  return 0;
}

int Init(const Args& args) {
  return OnHost([&](Host& host) { host.Init(args.Has("empty")); });
}

int Show(const Args& args) {
  const bool json = args.Has("json"), dot = args.Has("dot");
  if (json && dot) throw UsageError("--json and --dot exclude each other");
  std::optional<std::string> name;
  if (!args.Positionals().empty()) name = args.Positional(0);
  if (name && !json) throw UsageError("NAME is shown with --json only");
  return Print(OnHost([&](Host& host) {
    return json ? host.ShowJson(name) : dot ? host.ShowDot() : host.Show();
  }));
}

int Dump(const Args&) {
  std::string text;
  {
    ProgressLine progress("dump");
    text = OnHost([&](Host& host) { return host.Dump(progress.Report()); });
  }
  return Print(text);
}

int Load(const Args& args) {
  const std::string text = ReadFile(args.Positional(0));
  ProgressLine progress("load");
  return OnHost([&](Host& host) { host.Load(text, progress.Report()); });
}

int Reboot(const Args&) {
  return OnHost([](Host& host) { host.Reboot(); });
}

int Path(const Args&) {
  const std::string path = TarnCtl::Admin::HostPath();
  const std::string log = TarnCtl::Admin::WaitingLog(path);
  if (!log.empty()) {
    // Standard error: standard output stays the path alone, for scripts.
    std::fprintf(stderr,
                 "tarnhost: a commit waits in %s; copy the file together with it, or let any "
                 "program open the host first, which copies it in\n",
                 log.c_str());
  }
  return Print(path + "\n");
}

int AddPnic(const Args& args) {
  return OnHost([&](Host& host) { host.AddPnic(args.Positional(0)); });
}

int AddClient(const Args& args) {
  return OnHost([&](Host& host) { host.AddClient(args.Positional(0), args.Positional(1)); });
}

int AddSystemSwitch(const Args& args) {
  int32_t ports = HostCtl::Network::Portset::DEF_NUM_PORTS;
  if (auto v = args.Value("ports")) ports = ParseInt32(*v, "--ports");
  return OnHost([&](Host& host) { host.AddSystemSwitch(args.Positional(0), ports); });
}

int AddDVSwitch(const Args& args) {
  TarnCtl::Admin::DVSwitchSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  seed.switchId = args.Value("id");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("mtu")) seed.mtu = ParseUint32(*v, "--mtu");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  return OnHost([&](Host& host) { host.AddDVSwitch(seed); });
}

int AddDVPort(const Args& args) {
  TarnCtl::Admin::DVPortSeed seed;
  seed.dvs = args.Positional(0);
  seed.portId = args.Positional(1);
  seed.clients = args.Values("client");
  if (auto v = args.Value("connection-id")) seed.connectionId = ParseUint32(*v, "--connection-id");
  return OnHost([&](Host& host) { host.AddDVPort(seed); });
}

int AddOpaque(const Args& args) {
  TarnCtl::Admin::OpaqueSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("used")) seed.used = ParseInt32(*v, "--used");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  return OnHost([&](Host& host) { host.AddOpaqueSwitch(seed); });
}

int AddUplinkTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(3), "TIMEOUT");
  return OnHost([&](Host& host) {
    host.AddUplinkTimeout(args.Positional(0), args.Positional(1), lagId, timeout);
  });
}

int AddLagTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(2), "TIMEOUT");
  return OnHost([&](Host& host) { host.AddLagTimeout(args.Positional(0), lagId, timeout); });
}

int AddFault(const Args& args) {
  TarnCtl::Admin::FaultSeed seed;
  seed.operation = args.Positional(0);
  seed.on = args.Value("on");
  seed.message = args.Value("message");
  seed.detail = args.Value("detail");
  if (auto v = args.Value("skip")) seed.skip = ParseInt64(*v, "--skip");
  if (auto v = args.Value("times")) seed.times = ParseInt64(*v, "--times");
  return OnHost([&](Host& host) { host.AddFault(seed); });
}

int ClearFaults(const Args&) {
  return OnHost([](Host& host) { host.ClearFaults(); });
}

int RemovePnic(const Args& args) {
  return OnHost([&](Host& host) { host.RemovePnic(args.Positional(0)); });
}

int RemoveClient(const Args& args) {
  return OnHost([&](Host& host) { host.RemoveClient(args.Positional(0), args.Positional(1)); });
}

int RemoveSystemSwitch(const Args& args) {
  return OnHost([&](Host& host) { host.RemoveSystemSwitch(args.Positional(0)); });
}

int RemoveDVSwitch(const Args& args) {
  return OnHost([&](Host& host) { host.RemoveDVSwitch(args.Positional(0)); });
}

int RemoveDVPort(const Args& args) {
  return OnHost([&](Host& host) { host.RemoveDVPort(args.Positional(0), args.Positional(1)); });
}

int RemoveOpaque(const Args& args) {
  return OnHost([&](Host& host) { host.RemoveOpaqueSwitch(args.Positional(0)); });
}

int RemoveUplinkTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  return OnHost(
      [&](Host& host) { host.RemoveUplinkTimeout(args.Positional(0), args.Positional(1), lagId); });
}

int RemoveLagTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  return OnHost([&](Host& host) { host.RemoveLagTimeout(args.Positional(0), lagId); });
}

int RemoveFault(const Args& args) {
  const int64_t number = ParseInt64(args.Positional(0), "NUMBER");
  return OnHost([&](Host& host) { host.RemoveFault(number); });
}

int PrintList(Listing what, const Args& args) {
  const auto rows = OnHost([&](Host& host) { return host.List(what); });
  const std::string* only = args.Positionals().empty() ? nullptr : &args.Positional(0);
  std::string text;
  for (const auto& row : rows) {
    if (!only || row[0] == *only) text += Join(row, "\t") + "\n";
  }
  return Print(text);
}

int ListOperations(const Args&) {
  std::string text;
  for (const auto& operation : TarnCtl::Admin::LibraryOperations()) {
    text +=
        Join({operation.name, operation.faultable ? "yes" : "no", operation.target}, "\t") + "\n";
  }
  return Print(text);
}

}  // namespace TarnHost
