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
#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/listing.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/admin/whole_host.h"
#include "tarnhost/args.h"

namespace TarnHost {
namespace {

namespace Admin = TarnCtl::Admin;
using Admin::Listing;
using TarnCtl::Store::Db;

// Runs `body` on the host and commits what it did before the command
// succeeds: a commit that fails is then this command's failure ("tarnhost:
// ..." and status 1), not the session's end. Returns what `body` returns
// (0 for nothing).
template <typename Body>
auto OnHost(Body body) {
  Admin::Host host;
  if constexpr (std::is_void_v<decltype(body(host.db()))>) {
    body(host.db());
    host.Commit();
    return 0;
  } else {
    auto result = body(host.db());
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

  Admin::Progress Report() {
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
    text.reserve(static_cast<size_t>(info.st_size) + Admin::kLoadRoom);
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
  return OnHost([&](Db& db) { Admin::Init(db, args.Has("empty")); });
}

int Show(const Args& args) {
  const bool json = args.Has("json"), dot = args.Has("dot");
  if (json && dot) throw UsageError("--json and --dot exclude each other");
  std::optional<std::string> name;
  if (!args.Positionals().empty()) name = args.Positional(0);
  if (name && !json) throw UsageError("NAME is shown with --json only");
  return Print(OnHost([&](Db& db) {
    return json ? Admin::ShowJson(db, name) : dot ? Admin::ShowDot(db) : Admin::Show(db);
  }));
}

int Dump(const Args&) {
  std::string text;
  {
    ProgressLine progress("dump");
    text = OnHost([&](Db& db) { return Admin::DumpHost(db, progress.Report()); });
  }
  return Print(text);
}

int Load(const Args& args) {
  const std::string text = ReadFile(args.Positional(0));
  ProgressLine progress("load");
  return OnHost([&](Db& db) { Admin::LoadHost(db, text, progress.Report()); });
}

int Reboot(const Args&) {
  return OnHost([](Db& db) { Admin::Reboot(db); });
}

int Path(const Args&) {
  const std::string path = Admin::HostPath();
  const std::string log = Admin::WaitingLog(path);
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
  return OnHost([&](Db& db) { Admin::AddPnic(db, args.Positional(0)); });
}

int AddClient(const Args& args) {
  return OnHost([&](Db& db) { Admin::AddClient(db, args.Positional(0), args.Positional(1)); });
}

int AddSystemSwitch(const Args& args) {
  int32_t ports = HostCtl::Network::Portset::DEF_NUM_PORTS;
  if (auto v = args.Value("ports")) ports = ParseInt32(*v, "--ports");
  return OnHost([&](Db& db) { Admin::AddSystemSwitch(db, args.Positional(0), ports); });
}

int AddDVSwitch(const Args& args) {
  Admin::DVSwitchSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  seed.switchId = args.Value("id");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("mtu")) seed.mtu = ParseUint32(*v, "--mtu");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  return OnHost([&](Db& db) { Admin::AddDVSwitch(db, seed); });
}

int AddDVPort(const Args& args) {
  Admin::DVPortSeed seed;
  seed.dvs = args.Positional(0);
  seed.portId = args.Positional(1);
  seed.clients = args.Values("client");
  if (auto v = args.Value("connection-id")) seed.connectionId = ParseUint32(*v, "--connection-id");
  return OnHost([&](Db& db) { Admin::AddDVPort(db, seed); });
}

int AddOpaque(const Args& args) {
  Admin::OpaqueSeed seed;
  seed.name = args.Positional(0);
  seed.portset = args.Value("portset");
  if (auto v = args.Value("ports")) seed.ports = ParseInt32(*v, "--ports");
  if (auto v = args.Value("used")) seed.used = ParseInt32(*v, "--used");
  if (auto v = args.Value("uplinks")) seed.uplinks = SplitNames(*v, "--uplinks");
  return OnHost([&](Db& db) { Admin::AddOpaqueSwitch(db, seed); });
}

int AddUplinkTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(3), "TIMEOUT");
  return OnHost([&](Db& db) {
    Admin::AddUplinkTimeout(db, args.Positional(0), args.Positional(1), lagId, timeout);
  });
}

int AddLagTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  const uint32_t timeout = ParseUint32(args.Positional(2), "TIMEOUT");
  return OnHost([&](Db& db) { Admin::AddLagTimeout(db, args.Positional(0), lagId, timeout); });
}

int AddFault(const Args& args) {
  Admin::FaultSeed seed;
  seed.operation = args.Positional(0);
  seed.on = args.Value("on");
  seed.message = args.Value("message");
  seed.detail = args.Value("detail");
  if (auto v = args.Value("skip")) seed.skip = ParseInt64(*v, "--skip");
  if (auto v = args.Value("times")) seed.times = ParseInt64(*v, "--times");
  if (auto v = args.Value("delay")) seed.delayMs = ParseInt64(*v, "--delay");
  seed.pass = args.Has("pass");
  seed.always = args.Has("always");
  if (seed.always && args.Has("times")) throw UsageError("--always and --times exclude each other");
  return OnHost([&](Db& db) { Admin::AddFault(db, seed); });
}

int ClearFaults(const Args&) {
  return OnHost([](Db& db) { Admin::ClearFaults(db); });
}

int RemovePnic(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemovePnic(db, args.Positional(0)); });
}

int RemoveClient(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemoveClient(db, args.Positional(0), args.Positional(1)); });
}

int RemoveSystemSwitch(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemoveSystemSwitch(db, args.Positional(0)); });
}

int RemoveDVSwitch(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemoveDVSwitch(db, args.Positional(0)); });
}

int RemoveDVPort(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemoveDVPort(db, args.Positional(0), args.Positional(1)); });
}

int RemoveOpaque(const Args& args) {
  return OnHost([&](Db& db) { Admin::RemoveOpaqueSwitch(db, args.Positional(0)); });
}

int RemoveUplinkTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(2), "LAGID");
  return OnHost([&](Db& db) {
    Admin::RemoveUplinkTimeout(db, args.Positional(0), args.Positional(1), lagId);
  });
}

int RemoveLagTimeout(const Args& args) {
  const uint32_t lagId = ParseUint32(args.Positional(1), "LAGID");
  return OnHost([&](Db& db) { Admin::RemoveLagTimeout(db, args.Positional(0), lagId); });
}

int RemoveFault(const Args& args) {
  const int64_t number = ParseInt64(args.Positional(0), "NUMBER");
  return OnHost([&](Db& db) { Admin::RemoveFault(db, number); });
}

int PrintList(Listing what, const Args& args) {
  if (what == Listing::kFaults && args.Has("armed")) what = Listing::kArmedFaults;
  const auto rows = OnHost([&](Db& db) { return Admin::List(db, what); });
  const std::string* only = args.Positionals().empty() ? nullptr : &args.Positional(0);
  std::string text;
  for (const auto& row : rows) {
    if (!only || row[0] == *only) text += Join(row, "\t") + "\n";
  }
  return Print(text);
}

int ListOperations(const Args&) {
  std::string text;
  for (const auto& operation : Admin::LibraryOperations()) {
    text +=
        Join({operation.name, operation.faultable ? "yes" : "no", operation.target}, "\t") + "\n";
  }
  return Print(text);
}

}  // namespace TarnHost
