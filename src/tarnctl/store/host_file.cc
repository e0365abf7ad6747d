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
// The file format's write and read versions: 2 in write-ahead mode.
constexpr size_t kWriteVersionOffset = 18;
constexpr size_t kReadVersionOffset = 19;
constexpr unsigned char kWalVersion = 2;

// What to do about a host file that cannot be used: every such message ends
// with one of these, so that its one line names the file, the cause and the
// way out. Moving a file away or making a new host is advised only for a
// file that is positively not a host: for a host that failed to open, that
// advice would leave its log (and any change waiting there) behind.
constexpr const char* kReplace =
    "set TARN_HOST_DB to a host file, or move it away and run tarnhost init";
constexpr const char* kAnother = "set TARN_HOST_DB to a host file";
constexpr const char* kInit = "run tarnhost init";
constexpr const char* kNewer =
    "use the newer release that made it, or set TARN_HOST_DB to another host file";
constexpr const char* kReach = "check the path and its permissions, or set TARN_HOST_DB";
constexpr const char* kWritable = "set TARN_HOST_DB to a file in a writable directory";
constexpr const char* kRetry =
    "the host was not changed; try again, and check the disk if it fails again";
constexpr const char* kFree = "the host was not changed; free space on its disk and try again";
constexpr const char* kPermissions =
    "the host was not changed; check the permissions of the file, its log and its directory";
constexpr const char* kDamaged =
    "the host was not changed; keep a copy of it and of its log (the file beside it ending "
    "in -wal) before you repair or replace it";

HostCtlException CannotOpen(const std::string& path, const std::string& cause, const char* remedy) {
  const std::string text = "Cannot open host database " + path + ": " + cause + "; " + remedy;
  return HostCtlException(text, text);
}

HostCtlException CannotCreate(const std::string& path, const std::string& cause,
                              const char* remedy = kWritable) {
  const std::string text = "Cannot create host database " + path + ": " + cause + "; " + remedy;
  return HostCtlException(text, text);
}

// What to do after a system call on the host's files failed with `error`.
const char* RemedyFor(int error) {
  switch (error) {
    case EACCES:
    case EPERM:
    case EROFS:
      return kPermissions;
    case ENOSPC:
    case EDQUOT:
      return kFree;
    case ENOENT:
    case ENOTDIR:
    case ELOOP:
    case ENAMETOOLONG:
      return kReach;
    default:
      return kRetry;
  }
}

HostCtlException CannotOpenErrno(const std::string& path, const std::string& what, int error) {
  return CannotOpen(path, what + std::strerror(error), RemedyFor(error));
}

// The failure met while opening, as what it is.
HostCtlException CannotOpen(const std::string& path, const DbFailure& failure) {
  const std::string& cause = failure.cause();
  switch (failure.kind()) {
    case Db::Failure::kFull:
      return CannotOpen(path, cause, kFree);
    case Db::Failure::kPermission:
      return CannotOpen(path, cause, kPermissions);
    case Db::Failure::kNotADatabase:
      return CannotOpen(path, "not a host database (" + cause + ")", kReplace);
    case Db::Failure::kCorrupt:
      return CannotOpen(path, cause, kDamaged);
    default:
      return CannotOpen(path, cause, kRetry);
  }
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

// open() and pread() again when a signal interrupted them.
int OpenRetried(const char* path, int flags, mode_t mode = 0) {
  int fd;
  do fd = open(path, flags, mode);
  while (fd < 0 && errno == EINTR);
  return fd;
}

ssize_t ReadRetried(int fd, void* buffer, size_t size, off_t offset) {
  ssize_t got;
  do got = pread(fd, buffer, size, offset);
  while (got < 0 && errno == EINTR);
  return got;
}

// Opens `path` for its lock (reading only: no file is changed by it), and
// creates it when it is missing and `create` is set. O_NONBLOCK: opening a
// FIFO must not wait for a writer.
int OpenForLock(const std::string& path, bool create) {
  int fd = OpenRetried(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOCTTY | O_NONBLOCK);
  if (fd >= 0 || errno != ENOENT) {
    if (fd < 0) throw CannotOpenErrno(path, "", errno);
    return fd;
  }
  if (!create) throw CannotOpen(path, "no host yet", kInit);
  PrepareDirectory(path);
  fd = OpenRetried(path.c_str(), O_RDONLY | O_CREAT | O_CLOEXEC | O_NOCTTY, 0644);
  if (fd < 0) {
    throw CannotCreate(path, std::strerror(errno), RemedyFor(errno) == kFree ? kFree : kWritable);
  }
  return fd;
}

void Lock(int fd, const std::string& path, int timeoutSeconds) {
  const auto deadline = std::chrono::steady_clock::now() + std::chrono::seconds(timeoutSeconds);
  auto poll = std::chrono::milliseconds(1);
  while (flock(fd, LOCK_EX | LOCK_NB) != 0) {
    if (errno == EINTR) continue;
    if (errno != EWOULDBLOCK) throw CannotOpenErrno(path, "cannot lock it: ", errno);
    if (std::chrono::steady_clock::now() >= deadline) {
      const std::string text = "Host " + path + " is busy: another process holds its lock";
      throw HostCtlException(text, text + " (waited " + std::to_string(timeoutSeconds) + " s)");
    }
    std::this_thread::sleep_for(poll);
    poll = std::min(poll * 2, kLongestPoll);
  }
}

// What a file's first bytes say of it.
enum class Header {
  kEmpty,   // no host yet
  kHost,    // a host in rollback-journal mode (made by an older release)
  kLogged,  // a host in write-ahead mode
};

// Reads the header of the file `fd` holds: refuses what is not a host
// database of a version this library reads.
Header ReadHeader(int fd, const struct stat& info, const std::string& path) {
  if (S_ISDIR(info.st_mode)) throw CannotOpen(path, "is a directory", kAnother);
  if (!S_ISREG(info.st_mode)) throw CannotOpen(path, "is not a regular file", kAnother);
  if (info.st_size == 0) return Header::kEmpty;
  unsigned char header[kHeaderSize] = {};
  const ssize_t read = ReadRetried(fd, header, sizeof header, 0);
  if (read < 0) throw CannotOpenErrno(path, "cannot read its header: ", errno);
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
  return header[kWriteVersionOffset] == kWalVersion && header[kReadVersionOffset] == kWalVersion
             ? Header::kLogged
             : Header::kHost;
}

// The one path by which SQLite opens the file that `fd` holds: symbolic
// links resolved, and of hard links in one directory the least name.
std::string JournalPath(const std::string& path, const struct stat& info) {
  char resolved[PATH_MAX];
  if (realpath(path.c_str(), resolved) == nullptr) throw CannotOpenErrno(path, "", errno);
  const std::string real = resolved;
  if (info.st_nlink <= 1) return real;
  const std::string directory = Directory(real);
  DIR* dir = opendir(directory.c_str());
  if (dir == nullptr) throw CannotOpenErrno(path, "", errno);
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
          std::to_string(kSchemaVersion) + ";" + kSchemaSql + HostSql(true));
  transaction.Commit();
}

bool Exists(const std::string& file, off_t* size = nullptr) {
  struct stat info;
  if (stat(file.c_str(), &info) != 0) return false;
  if (size != nullptr) *size = info.st_size;
  return true;
}

void SyncDirectory(const std::string& path, const std::string& directory) {
  const int fd = OpenRetried(directory.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
  if (fd < 0 || fsync(fd) != 0) {
    const int error = errno;
    if (fd >= 0) close(fd);
    throw CannotCreate(path, std::string("cannot sync its directory: ") + std::strerror(error),
                       RemedyFor(error));
  }
  close(fd);
}

// Builds the default host in a new file beside `real` (the host file as
// SQLite names it) and renames it over `real`: a crash at any point leaves
// `real` as it was (empty, or half-made by an older release) or a whole host,
// and at worst `<real>.new` beside it, which the next creation replaces.
// Returns the new file's descriptor, locked; `held` becomes its status.
// REQUIRES: the caller holds the lock of the file now at `real`.
int CreateHost(const std::string& path, const std::string& real, struct stat* held) {
  off_t logSize = 0;
  if (Exists(real + "-wal", &logSize) && logSize > 0) {
    // Another file's committed changes: a new host beside them would take
    // them for its own.
    throw CannotCreate(path,
                       real +
                           "-wal holds changes of a host file that is not there (moved away "
                           "without its log?)",
                       "move the log to the host file it belongs to; nothing was changed");
  }
  const std::string building = real + ".new";
  unlink(building.c_str());
  const int fd = OpenRetried(building.c_str(), O_RDWR | O_CREAT | O_EXCL | O_CLOEXEC | O_NOCTTY,
                             held->st_mode & 07777);
  if (fd < 0) throw CannotCreate(path, std::strerror(errno));
  try {
    if (fchmod(fd, held->st_mode & 07777) != 0 || flock(fd, LOCK_EX) != 0) {
      throw CannotCreate(path, std::strerror(errno), RemedyFor(errno));
    }
    if (fchown(fd, held->st_uid, held->st_gid) != 0) {
      // Another user's empty file: the new host is this user's.
    }
    // The file is thrown away if anything fails: no journal, no syncs but
    // the one below. Switched to the log's mode last, so that its header
    // says so from the start (host_vfs.h); closing it leaves no log.
    try {
      auto db = Db::OpenFile(building, path);
      db->Exec("PRAGMA locking_mode=EXCLUSIVE; PRAGMA journal_mode=OFF; PRAGMA synchronous=OFF");
      BuildDefaultHost(*db);
      db->Exec("PRAGMA journal_mode=WAL");
    } catch (const DbFailure& failure) {
      throw CannotCreate(path, failure.cause(),
                         failure.kind() == Db::Failure::kFull ? kFree : kRetry);
    }
    off_t leftover = 0;
    if (Exists(building + "-wal", &leftover)) {
      unlink((building + "-wal").c_str());
      if (leftover > 0) throw CannotCreate(path, "the new host's log was not copied in", kRetry);
    }
    if (fdatasync(fd) != 0) throw CannotCreate(path, std::strerror(errno), RemedyFor(errno));
    if (rename(building.c_str(), real.c_str()) != 0) {
      throw CannotCreate(path, std::strerror(errno), RemedyFor(errno));
    }
  } catch (...) {
    unlink(building.c_str());
    close(fd);
    throw;
  }
  try {
    SyncDirectory(path, Directory(real));
    if (fstat(fd, held) != 0) throw CannotOpenErrno(path, "", errno);
  } catch (...) {
    close(fd);
    throw;
  }
  return fd;
}

// An older release built a new host in the file itself, with a rollback
// journal: a run killed then left a journal that SQLite must roll back
// before the header means anything. Rolls it back, unless the file is
// positively another application's.
void RollBackCreation(int fd, const std::string& real, const std::string& path) {
  off_t size = 0;
  if (!Exists(real + "-journal", &size) || size == 0) return;
  unsigned char header[kHeaderSize] = {};
  const ssize_t read = ReadRetried(fd, header, sizeof header, 0);
  if (read == static_cast<ssize_t>(kHeaderSize) &&
      std::memcmp(header, kSqliteMagic, sizeof kSqliteMagic) == 0) {
    const int32_t applicationId = BigEndian32(header + kApplicationIdOffset);
    if (applicationId != 0 && applicationId != kApplicationId) return;
  }
  try {
    Db::OpenFile(real, path)->Exec("PRAGMA schema_version");
  } catch (const DbFailure& failure) {
    throw CannotOpen(path, failure);
  }
}

// Whether this process can change the host at `real`: write the file, and
// its log or else the directory the log is made in.
bool Writable(const std::string& real) {
  if (access(real.c_str(), W_OK) != 0) return false;
  const std::string log = real + "-wal";
  if (Exists(log)) return access(log.c_str(), W_OK) == 0;
  return access(Directory(real).c_str(), W_OK) == 0;
}

// Opens the host at `real` for SQLite: read-write through its log, or only
// read when this process cannot write it.
std::unique_ptr<Db> Connect(const std::string& real, const std::string& path, Header header) {
  if (!Writable(real)) {
    off_t logSize = 0;
    if (Exists(real + "-wal", &logSize) && logSize > 0) {
      throw CannotOpen(path,
                       "a change waits in its log " + real + "-wal, which this user cannot copy in",
                       "the host was not changed; run as a user who can write the file, its log "
                       "and its directory");
    }
    try {
      auto db = Db::OpenFile(real, path, Db::Access::kRead);
      db->Exec("SELECT count(*) FROM sqlite_schema");
      return db;
    } catch (const DbFailure& failure) {
      throw CannotOpen(path, failure);
    }
  }
  try {
    auto db = Db::OpenFile(real, path);
    // Reading the schema finds a file that is damaged past its header. The
    // first 8 MiB of the file are read through a mapping rather than a
    // read() a page: a lookup costs no system call per level of its tree.
    // Mapped pages count as resident, so the mapping stays small
    // (docs/performance.md weighs the size).
    db->Exec("PRAGMA mmap_size=8388608");
    db->UseLog(header == Header::kLogged);
    db->Exec("SELECT count(*) FROM sqlite_schema");
    return db;
  } catch (const DbFailure& failure) {
    throw CannotOpen(path, failure);
  }
}

// A host whose creation by an older release did not finish: SQLite's
// header is there, the tables are not.
bool HalfMade(Db& db, const std::string& path) {
  try {
    auto statement = db.Prepare("SELECT 1 FROM sqlite_schema WHERE name = 'meta'");
    return !statement.Step();
  } catch (const DbFailure& failure) {
    throw CannotOpen(path, failure);
  }
}

// Brings a host of an older schema version to this one: in place when
// this process can write it, else through a view for reading.
void Upgrade(Db& db, const std::string& real, const std::string& path) {
  try {
    int64_t version = 0;
    {
      auto statement = db.Prepare("PRAGMA user_version");
      if (statement.Step()) version = statement.Int(0);
    }
    if (version >= kSchemaVersion) return;
    if (!Writable(real)) {
      db.Exec(kFaultViewOfVersion1);
      return;
    }
    Transaction transaction(db);
    db.Exec(std::string(kFaultColumnsSince2) +
            "PRAGMA user_version=" + std::to_string(kSchemaVersion));
    transaction.Commit();
  } catch (const DbFailure& failure) {
    throw CannotOpen(path, failure);
  }
}

}  // namespace

std::string WaitingLog(const std::string& path) {
  char resolved[PATH_MAX];
  if (realpath(path.c_str(), resolved) == nullptr) return "";
  const std::string log = std::string(resolved) + "-wal";
  off_t size = 0;
  return Exists(log, &size) && size > 0 ? log : "";
}

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
    int fd = OpenForLock(path, options.create);
    try {
      Lock(fd, path, options.lockTimeoutSeconds);
      struct stat held, named;
      if (fstat(fd, &held) != 0) throw CannotOpenErrno(path, "", errno);
      if (stat(path.c_str(), &named) != 0 || named.st_ino != held.st_ino ||
          named.st_dev != held.st_dev) {
        close(fd);  // replaced or removed while we waited: take the new one
        continue;
      }
      if (S_ISREG(held.st_mode)) {
        RollBackCreation(fd, JournalPath(path, held), path);
        if (fstat(fd, &held) != 0) throw CannotOpenErrno(path, "", errno);
      }
      Header header = ReadHeader(fd, held, path);
      const std::string real = JournalPath(path, held);
      std::unique_ptr<Db> db;
      bool halfMade = false;
      if (header != Header::kEmpty) {
        db = Connect(real, path, header);
        // Only an older release's creation, in rollback-journal mode, can
        // stop half-way; a host in log mode was renamed into place whole.
        halfMade = header == Header::kHost && HalfMade(*db, path);
        if (halfMade) {
          db.reset();
        } else {
          Upgrade(*db, real, path);
        }
      }
      bool created = false;
      if (!db) {
        if (!options.create) {
          throw CannotOpen(
              path,
              halfMade ? "no host yet (its creation did not finish)" : "no host yet (empty file)",
              kInit);
        }
        const int made = CreateHost(path, real, &held);
        close(fd);
        fd = made;
        db = Connect(real, path, Header::kLogged);
        created = true;
      }
      return std::unique_ptr<HostFile>(new HostFile(path, fd, std::move(db), created));
    } catch (...) {
      close(fd);
      throw;
    }
  }
}

}  // namespace TarnCtl::Store
