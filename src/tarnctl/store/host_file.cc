#include "tarnctl/store/host_file.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <chrono>
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <thread>
#include <vector>

#include "hostctl/exception.h"
#include "tarnctl/store/default_host.h"
#include "tarnctl/store/schema.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Store {

using HostCtl::Lib::HostCtlException;

namespace {

constexpr int kDefaultLockTimeoutSeconds = 30;
constexpr int kMaxLockTimeoutSeconds = 86400;
constexpr auto kLongestPoll = std::chrono::milliseconds(20);

// The start of an SQLite file: its magic text, the schema version a program
// keeps (user_version, offset 60) and the application id (offset 68), both
// big-endian.
constexpr char kSqliteMagic[16] = "SQLite format 3";
constexpr size_t kHeaderSize = 100;
constexpr size_t kUserVersionOffset = 60;
constexpr size_t kApplicationIdOffset = 68;

// What to do about a host file that cannot be used: every such message ends
// with one of these, so that its one line names the file, the cause and the
// way out.
constexpr const char* kReplace =
    "set TARN_HOST_DB to a host file, or move it away and run tarnhost init";
constexpr const char* kAnother = "set TARN_HOST_DB to a host file";
constexpr const char* kInit = "run tarnhost init";
constexpr const char* kNewer =
    "use the newer release that made it, or set TARN_HOST_DB to another host file";
constexpr const char* kReach = "check the path and its permissions, or set TARN_HOST_DB";
constexpr const char* kWritable = "set TARN_HOST_DB to a file in a writable directory";

HostCtlException CannotOpen(const std::string& path, const std::string& cause, const char* remedy) {
  const std::string text = "Cannot open host database " + path + ": " + cause + "; " + remedy;
  return HostCtlException(text, text);
}

HostCtlException CannotCreate(const std::string& path, const std::string& cause) {
  const std::string text = "Cannot create host database " + path + ": " + cause + "; " + kWritable;
  return HostCtlException(text, text);
}

std::string Directory(const std::string& path) {
  const auto slash = path.rfind('/');
  if (slash == std::string::npos) return ".";
  if (slash == 0) return "/";
  return path.substr(0, slash);
}

void PrepareDirectory(const std::string& path) {
  const std::string directory = Directory(path);
  for (size_t i = 1; i <= directory.size(); ++i) {
    if (i == directory.size() || directory[i] == '/') {
      mkdir(directory.substr(0, i).c_str(), 0755);  // EEXIST and others: open tells
    }
  }
}

int32_t BigEndian32(const unsigned char* bytes) {
  return static_cast<int32_t>((uint32_t{bytes[0]} << 24) | (uint32_t{bytes[1]} << 16) |
                              (uint32_t{bytes[2]} << 8) | uint32_t{bytes[3]});
}

// Opens `path` for its lock (reading only: no file is changed by it), and
// creates it when it is missing and `create` is set. O_NONBLOCK: opening a
// FIFO must not wait for a writer.
int OpenForLock(const std::string& path, bool create) {
  int fd = open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
  if (fd >= 0 || errno != ENOENT) {
    if (fd < 0) throw CannotOpen(path, std::strerror(errno), kReach);
    return fd;
  }
  if (!create) throw CannotOpen(path, "no host yet", kInit);
  PrepareDirectory(path);
  fd = open(path.c_str(), O_RDONLY | O_CREAT | O_CLOEXEC | O_NOCTTY, 0644);
  if (fd < 0) throw CannotCreate(path, std::strerror(errno));
  return fd;
}

void Lock(int fd, const std::string& path, int timeoutSeconds) {
  const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(timeoutSeconds);
  auto poll = std::chrono::milliseconds(1);
  while (flock(fd, LOCK_EX | LOCK_NB) != 0) {
    if (errno == EINTR) continue;
    if (errno != EWOULDBLOCK)
      throw CannotOpen(path, std::string("cannot lock it: ") + std::strerror(errno), kReach);
    if (std::chrono::steady_clock::now() >= deadline) {
      const std::string text = "Host " + path + " is busy: another process holds its lock";
      throw HostCtlException(text, text + " (waited " + std::to_string(timeoutSeconds) + " s)");
    }
    std::this_thread::sleep_for(poll);
    poll = std::min(poll * 2, kLongestPoll);
  }
}

// Refuses what is not a host database of a version this library reads;
// false for an empty file (no host yet).
bool CheckHeader(int fd, const struct stat& info, const std::string& path) {
  if (S_ISDIR(info.st_mode)) throw CannotOpen(path, "is a directory", kAnother);
  if (!S_ISREG(info.st_mode)) throw CannotOpen(path, "is not a regular file", kAnother);
  if (info.st_size == 0) return false;
  unsigned char header[kHeaderSize] = {};
  const ssize_t read = pread(fd, header, sizeof header, 0);
  if (read < 0) throw CannotOpen(path, std::strerror(errno), kReach);
  if (static_cast<size_t>(read) < sizeof kSqliteMagic ||
      std::memcmp(header, kSqliteMagic, sizeof kSqliteMagic) != 0) {
    throw CannotOpen(path, "not a host database (not an SQLite database)", kReplace);
  }
  if (static_cast<size_t>(read) < kHeaderSize) {
    throw CannotOpen(path, "not a host database (truncated header)", kReplace);
  }
  const int32_t applicationId = BigEndian32(header + kApplicationIdOffset);
  if (applicationId != kApplicationId) {
    char hex[32];
    std::snprintf(hex, sizeof hex, "0x%x", static_cast<unsigned>(applicationId));
    throw CannotOpen(path, std::string("not a host database (application id ") + hex + ")",
                     kReplace);
  }
  const int32_t version = BigEndian32(header + kUserVersionOffset);
  if (version > kSchemaVersion) {
    throw CannotOpen(path,
                     "schema version " + std::to_string(version) +
                         " is newer than this library's " + std::to_string(kSchemaVersion),
                     kNewer);
  }
  if (version < 1) throw CannotOpen(path, "not a host database (no schema version)", kReplace);
  return true;
}

// The one path by which SQLite opens the file that `fd` holds: symbolic
// links resolved, and of hard links in one directory the least name.
std::string JournalPath(const std::string& path, const struct stat& info) {
  char resolved[PATH_MAX];
  if (realpath(path.c_str(), resolved) == nullptr) {
    throw CannotOpen(path, std::strerror(errno), kReach);
  }
  const std::string real = resolved;
  if (info.st_nlink <= 1) return real;
  const std::string directory = Directory(real);
  DIR* dir = opendir(directory.c_str());
  if (dir == nullptr) throw CannotOpen(path, std::strerror(errno), kReach);
  std::vector<std::string> names;
  while (const dirent* entry = readdir(dir)) {
    struct stat other;
    if (entry->d_ino == info.st_ino &&
        fstatat(dirfd(dir), entry->d_name, &other, AT_SYMLINK_NOFOLLOW) == 0 &&
        other.st_ino == info.st_ino && other.st_dev == info.st_dev) {
      names.emplace_back(entry->d_name);
    }
  }
  closedir(dir);
  if (names.size() < info.st_nlink || names.empty()) {
    throw CannotOpen(path,
                     "it has a hard link in another directory, and runs through the two names "
                     "would not share their journal",
                     "use a symbolic link instead");
  }
  return directory + "/" + *std::min_element(names.begin(), names.end());
}

// Builds the default host in an empty database, in one transaction.
void BuildDefaultHost(Db& db) {
  Transaction transaction(db);
  db.Exec("PRAGMA application_id=" + std::to_string(kApplicationId) + "; PRAGMA user_version=" +
          std::to_string(kSchemaVersion) + ";" + kSchemaSql + kDefaultHostSql);
  transaction.Commit();
}

}  // namespace

int LockTimeoutFrom(const char* text) {
  if (text == nullptr || *text == '\0') return kDefaultLockTimeoutSeconds;
  char* end = nullptr;
  const long value = std::strtol(text, &end, 10);
  if (*end != '\0' || value < 0 || value > kMaxLockTimeoutSeconds) {
    return kDefaultLockTimeoutSeconds;
  }
  return static_cast<int>(value);
}

HostFile::HostFile(std::string path, int lockFd, std::unique_ptr<Db> db, bool created)
    : path_(std::move(path)), lockFd_(lockFd), db_(std::move(db)), created_(created) {}

HostFile::~HostFile() {
  db_.reset();
  if (lockFd_ >= 0) close(lockFd_);  // lets go of the lock
}

void HostFile::ForgetLockInChild() {
  if (lockFd_ >= 0) close(lockFd_);
  lockFd_ = -1;
}

std::unique_ptr<HostFile> HostFile::Open(const Location& location, const OpenOptions& options) {
  const std::string& path = location.path;
  if (location.kind == Location::Kind::kMemory) {
    auto db = Db::OpenMemory(path);
    BuildDefaultHost(*db);
    return std::unique_ptr<HostFile>(new HostFile(path, -1, std::move(db), false));
  }
  for (;;) {
    const int fd = OpenForLock(path, options.create);
    try {
      Lock(fd, path, options.lockTimeoutSeconds);
      struct stat held, named;
      if (fstat(fd, &held) != 0) throw CannotOpen(path, std::strerror(errno), kReach);
      if (stat(path.c_str(), &named) != 0 || named.st_ino != held.st_ino ||
          named.st_dev != held.st_dev) {
        close(fd);  // replaced or removed while we waited: take the new one
        continue;
      }
      const bool hasHost = CheckHeader(fd, held, path);
      if (!hasHost && !options.create) {
        throw CannotOpen(path, "no host yet (empty file)", kInit);
      }
      auto db = Db::OpenFile(JournalPath(path, held), path);
      try {
        // Reading the schema finds a file that is damaged past its header.
        // The first 8 MiB of the file (all of a host of some 60,000 port
        // groups) are read through a mapping rather than a read() a page: a
        // lookup costs no system call per level of its tree. Mapped pages
        // count as resident, so the mapping stays small.
        db->Exec("PRAGMA mmap_size=8388608");
        if (hasHost) db->UseLog();
        db->Exec("SELECT count(*) FROM sqlite_schema");
      } catch (const HostCtlException& e) {
        throw CannotOpen(path, e.GetMessage().substr(e.GetMessage().rfind(": ") + 2), kReplace);
      }
      if (!hasHost) {
        // Built with a rollback journal, before the log is used: the
        // header that CheckHeader reads (application id, schema version)
        // is then in the file itself from the first commit on, and a
        // crash while building leaves an empty file, as before.
        try {
          BuildDefaultHost(*db);
          db->UseLog();
        } catch (const HostCtlException& e) {
          throw CannotCreate(path, e.GetMessage());
        }
      }
      return std::unique_ptr<HostFile>(new HostFile(path, fd, std::move(db), !hasHost));
    } catch (...) {
      close(fd);
      throw;
    }
  }
}

}  // namespace TarnCtl::Store
