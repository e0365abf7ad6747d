#include "tarnhost/commands.h"

#include <dirent.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <csignal>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <string>
#include <type_traits>

#include "hostctl/exception.h"
#include "hostctl/network.h"
#include "tarnctl/admin/diff.h"
#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/listing.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/snapshots.h"
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

// A state of the host to compare, open privately: a snapshot of the host,
// or a dump (a file, "-": standard input) loaded into a host in memory.
class State {
 public:
  explicit State(const std::string& source) {
    const std::string host = Admin::HostPath();
    if (source != "-" && Admin::HasSnapshot(host, source)) {
      snapshot_ = Admin::OpenSnapshot(host, source);
      return;
    }
    struct stat info;
    if (source != "-" && stat(source.c_str(), &info) != 0 && errno == ENOENT) {
      throw HostCtl::Lib::HostCtlException(
          "No snapshot or file named " + source + " (tarnhost snapshot list lists the snapshots)",
          "");
    }
    const std::string text = ReadFile(source);
    dump_.emplace(Admin::Host::Open(TarnCtl::Store::Location::Memory(source)));
    Admin::LoadHost(dump_->db(), text);
  }
  Db& db() { return snapshot_ ? *snapshot_ : dump_->db(); }

 private:
  std::unique_ptr<Db> snapshot_;
  std::optional<Admin::Host> dump_;
};

std::string DiffOutput(const std::vector<Admin::Difference>& differences, bool json) {
  if (!json) return Admin::DiffText(differences);
  return Admin::DiffJson(differences).dump(2, ' ', false, Admin::Json::error_handler_t::replace) +
         "\n";
}

std::string SnapshotName(const Args& args) {
  const std::string& name = args.Positional(0);
  const std::string problem = Admin::SnapshotNameProblem(name);
  if (!problem.empty()) {
    throw UsageError("snapshot name " + name + " " + problem + " (a name is 1 to " +
                     std::to_string(Admin::kSnapshotNameMax) +
                     " bytes without '/' or a control character, not starting with '.')");
  }
  return name;
}

// A folder of its own for `tarnhost try`, removed with what is in it when
// the object goes.
class ScratchFolder {
 public:
  ScratchFolder() {
    const char* tmp = std::getenv("TMPDIR");
    path_ = std::string(tmp && *tmp ? tmp : "/tmp") + "/tarnhost-try.XXXXXX";
    if (mkdtemp(path_.data()) == nullptr) {
      throw HostCtl::Lib::HostCtlException(
          "cannot create a folder for the copy of the host: " + std::string(std::strerror(errno)),
          "");
    }
  }
  ~ScratchFolder() {
    if (DIR* folder = opendir(path_.c_str())) {
      while (const dirent* entry = readdir(folder)) {
        const std::string name = entry->d_name;
        if (name != "." && name != "..") unlink((path_ + "/" + name).c_str());
      }
      closedir(folder);
    }
    rmdir(path_.c_str());
  }
  ScratchFolder(const ScratchFolder&) = delete;
  ScratchFolder& operator=(const ScratchFolder&) = delete;
  const std::string& path() const { return path_; }

 private:
  std::string path_;
};

// Runs `command` with `environment` added, as the shell would (its exit
// status; 128 + the signal that killed it; 127 when it cannot be run).
// Interrupts from the terminal are the command's while it runs.
int RunCommand(const std::vector<std::string>& command,
               const std::vector<std::pair<const char*, std::string>>& environment) {
  std::fflush(stdout);
  std::fflush(stderr);
  struct sigaction ignore = {}, oldInt, oldQuit;
  ignore.sa_handler = SIG_IGN;
  sigaction(SIGINT, &ignore, &oldInt);
  sigaction(SIGQUIT, &ignore, &oldQuit);
  const pid_t child = fork();
  if (child == 0) {
    sigaction(SIGINT, &oldInt, nullptr);
    sigaction(SIGQUIT, &oldQuit, nullptr);
    for (const auto& [name, value] : environment) setenv(name, value.c_str(), 1);
    std::vector<char*> argv;
    for (const auto& word : command) argv.push_back(const_cast<char*>(word.c_str()));
    argv.push_back(nullptr);
    execvp(argv[0], argv.data());
    std::fprintf(stderr, "tarnhost: cannot run %s: %s\n", argv[0], std::strerror(errno));
    _exit(127);
  }
  int status = 0;
  const int error = errno;
  bool waited = child > 0;
  while (waited && waitpid(child, &status, 0) < 0) {
    if (errno != EINTR) waited = false;
  }
  sigaction(SIGINT, &oldInt, nullptr);
  sigaction(SIGQUIT, &oldQuit, nullptr);
  if (child < 0) {
    throw HostCtl::Lib::HostCtlException(
        "cannot run " + command[0] + ": " + std::string(std::strerror(error)), "");
  }
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
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
  if (name && dot) throw UsageError("NAME is shown as text or with --json, not as a graph");
  return Print(OnHost([&](Db& db) {
    return json   ? Admin::ShowJson(db, name)
           : dot  ? Admin::ShowDot(db)
           : name ? Admin::Show(db, *name)
                  : Admin::Show(db);
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

int Diff(const Args& args) {
  const auto& given = args.Positionals();
  const bool layers = args.Has("layers");
  if (layers && !given.empty()) throw UsageError("--layers compares the host's own layers");
  if (!layers && given.empty()) throw UsageError("missing A");
  try {
    // The host is opened only to be compared: a snapshot, replaced by a
    // rename, stays as it was opened, and `tarnhost dump | tarnhost diff
    // A -` must not wait for the host's lock.
    std::vector<Admin::Difference> differences;
    if (layers) {
      differences = Admin::DiffLayers(Admin::Host().db());
    } else if (given.size() == 1) {
      State from(given[0]);
      differences = Admin::DiffHosts(from.db(), Admin::Host().db());
    } else {
      State from(given[0]), to(given[1]);
      differences = Admin::DiffHosts(from.db(), to.db());
    }
    Print(DiffOutput(differences, args.Has("json")));
    return differences.empty() ? 0 : 1;
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::fprintf(stderr, "tarnhost: %s\n", Admin::Reason(e).c_str());
  } catch (const std::exception& e) {
    std::fprintf(stderr, "tarnhost: %s\n", e.what());
  }
  return 2;
}

int SaveSnapshot(const Args& args) {
  const std::string name = SnapshotName(args);
  return OnHost([&](Db& db) { Admin::SaveSnapshot(db, Admin::HostPath(), name); });
}

int RestoreSnapshot(const Args& args) {
  const std::string name = SnapshotName(args);
  Admin::Host host;
  Admin::RestoreSnapshot(host, name);
  host.Commit();
  return 0;
}

int ListSnapshots(const Args&) {
  std::string text;
  for (const auto& name : Admin::Snapshots(Admin::HostPath())) text += name + "\n";
  return Print(text);
}

int RemoveSnapshot(const Args& args) {
  const std::string name = SnapshotName(args);
  return OnHost([&](Db&) { Admin::RemoveSnapshot(Admin::HostPath(), name); });
}

int Try(const Args& args) {
  ScratchFolder folder;
  const std::string copy = folder.path() + "/host.db", trace = folder.path() + "/trace";
  // Copied under the host's lock, which goes before the command runs.
  OnHost([&](Db& db) { Admin::CopyHost(db, copy); });
  std::vector<std::pair<const char*, std::string>> environment = {{"TARN_HOST_DB", copy}};
  if (args.Has("trace")) environment.push_back({"TARN_TRACE", trace});
  const int status = RunCommand(args.Positionals(), environment);

  std::vector<Admin::Difference> differences;
  {
    Admin::Host host;
    Admin::Host tried = Admin::Host::Open(TarnCtl::Store::Location::File(copy), {.create = false});
    differences = Admin::DiffHosts(host.db(), tried.db());
  }
  const bool json = args.Has("json");
  if (!args.Has("trace")) {
    Print(DiffOutput(differences, json));
    return status;
  }
  std::string calls;
  if (access(trace.c_str(), F_OK) == 0) calls = ReadFile(trace);
  if (!json) {
    Print(DiffOutput(differences, false) + calls);
    return status;
  }
  Admin::Json lines = Admin::Json::array();
  for (size_t start = 0; start < calls.size();) {
    const size_t end = calls.find('\n', start);
    lines.push_back(calls.substr(start, end - start));
    start = end == std::string::npos ? calls.size() : end + 1;
  }
  Admin::Json document = {{"diff", Admin::DiffJson(differences)}, {"trace", lines}};
  Print(document.dump(2, ' ', false, Admin::Json::error_handler_t::replace) + "\n");
  return status;
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
