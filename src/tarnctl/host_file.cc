#include "tarnctl/host_file.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <thread>

#include "hostctl/exception.h"
#include "tarnctl/default_host.h"
#include "tarnctl/schema.h"
#include "tarnctl/session.h"

namespace TarnCtl::Detail {

using HostCtl::Lib::HostCtlException;

namespace {

constexpr int kDefaultLockTimeoutSeconds = 30;
constexpr int kBusyTimeoutMs = 5000;
constexpr auto kLockPoll = std::chrono::milliseconds(20);

HostCtlException CannotOpen(const std::string& path, const std::string& cause) {
  std::string text = "Cannot open host database " + path + ": " + cause;
  return HostCtlException(text, text);
}

HostCtlException CannotCreate(const std::string& path, const std::string& cause) {
  std::string text = "Cannot create host database " + path + ": " + cause;
  return HostCtlException(text, text);
}

std::string Directory(const std::string& path) {
  const auto slash = path.rfind('/');
  if (slash == std::string::npos) return ".";
  if (slash == 0) return "/";
  return path.substr(0, slash);
}

int LockTimeoutSeconds() {
  const char* text = std::getenv("TARN_LOCK_TIMEOUT");
  if (text == nullptr || *text == '\0') return kDefaultLockTimeoutSeconds;
  char* end = nullptr;
  const long value = std::strtol(text, &end, 10);
  if (*end != '\0' || value < 0 || value > 86400) return kDefaultLockTimeoutSeconds;
  return static_cast<int>(value);
}

void SyncPath(const std::string& path, int flags) {
  const int fd = open(path.c_str(), flags | O_CLOEXEC);
  if (fd < 0) return;
  fsync(fd);
  close(fd);
}

// One integer pragma of a freshly opened file; throws with SQLite's text
// when the file cannot be read as a database.
int64_t ReadPragma(sqlite3* db, const std::string& path, const char* sql) {
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(db, sql, -1, &stmt, nullptr) != SQLITE_OK) {
    throw CannotOpen(path, sqlite3_errmsg(db));
  }
  const int rc = sqlite3_step(stmt);
  const int64_t value = rc == SQLITE_ROW ? sqlite3_column_int64(stmt, 0) : 0;
  sqlite3_finalize(stmt);
  if (rc != SQLITE_ROW) throw CannotOpen(path, sqlite3_errmsg(db));
  return value;
}

void Check(sqlite3* db, const std::string& path) {
  const int64_t applicationId = ReadPragma(db, path, "PRAGMA application_id");
  if (applicationId != kApplicationId) {
    char hex[32];
    std::snprintf(hex, sizeof hex, "0x%llx", static_cast<unsigned long long>(applicationId));
    throw CannotOpen(path, std::string("not a host database (application id ") + hex + ")");
  }
  const int64_t version = ReadPragma(db, path, "PRAGMA user_version");
  if (version > kSchemaVersion) {
    throw CannotOpen(path, "schema version " + std::to_string(version) +
                               " is newer than this library's " + std::to_string(kSchemaVersion));
  }
  if (version < 1) throw CannotOpen(path, "not a host database (no schema version)");
}

}  // namespace

std::string HostDatabasePath() {
  if (const char* path = std::getenv("TARN_HOST_DB"); path != nullptr && *path != '\0') {
    return path;
  }
  if (geteuid() == 0) return "/var/lib/tarnhost/host.db";
  if (const char* state = std::getenv("XDG_STATE_HOME"); state != nullptr && *state == '/') {
    return std::string(state) + "/tarnhost/host.db";
  }
  const char* home = std::getenv("HOME");
  return std::string(home != nullptr && *home != '\0' ? home : ".") +
         "/.local/state/tarnhost/host.db";
}

void PrepareDirectory(const std::string& path) {
  const std::string directory = Directory(path);
  for (size_t i = 1; i <= directory.size(); ++i) {
    if (i == directory.size() || directory[i] == '/') {
      mkdir(directory.substr(0, i).c_str(), 0755);  // EEXIST and others: open tells
    }
  }
}

int LockHost(const std::string& path) {
  const std::string lockPath = path + ".lock";
  const int fd = open(lockPath.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0644);
  if (fd < 0) {
    throw CannotOpen(path, "cannot open its lock file " + lockPath + ": " + std::strerror(errno));
  }
  const auto deadline =
      std::chrono::steady_clock::now() + std::chrono::seconds(LockTimeoutSeconds());
  while (flock(fd, LOCK_EX | LOCK_NB) != 0) {
    if (errno != EWOULDBLOCK && errno != EINTR) {
      const std::string cause = std::strerror(errno);
      close(fd);
      throw CannotOpen(path, "cannot lock " + lockPath + ": " + cause);
    }
    if (std::chrono::steady_clock::now() >= deadline) {
      close(fd);
      const std::string text = "Host " + path + " is busy: another process holds its lock";
      throw HostCtlException(text, text + " (waited " + std::to_string(LockTimeoutSeconds()) +
                                       " s for " + lockPath + ")");
    }
    std::this_thread::sleep_for(kLockPoll);
  }
  return fd;
}

bool HostFileExists(const std::string& path) {
  struct stat info;
  return lstat(path.c_str(), &info) == 0 || errno != ENOENT;
}

void CreateHostFile(const std::string& path) {
  const std::string temporary = path + ".new";
  unlink(temporary.c_str());
  unlink((temporary + "-journal").c_str());
  sqlite3* db = nullptr;
  if (sqlite3_open_v2(temporary.c_str(), &db, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE,
                      nullptr) != SQLITE_OK) {
    const std::string cause = db != nullptr ? sqlite3_errmsg(db) : "out of memory";
    sqlite3_close(db);
    throw CannotCreate(path, cause);
  }
  const std::string script =
      "PRAGMA synchronous=FULL; BEGIN; PRAGMA application_id=" + std::to_string(kApplicationId) +
      "; PRAGMA user_version=" + std::to_string(kSchemaVersion) + ";" + kSchemaSql +
      kDefaultHostSql + "COMMIT;";
  char* error = nullptr;
  const int rc = sqlite3_exec(db, script.c_str(), nullptr, nullptr, &error);
  const std::string cause = error != nullptr ? error : "";
  sqlite3_free(error);
  sqlite3_close(db);
  if (rc != SQLITE_OK) {
    unlink(temporary.c_str());
    throw CannotCreate(path, cause);
  }
  SyncPath(temporary, O_RDONLY);
  if (rename(temporary.c_str(), path.c_str()) != 0) {
    const std::string reason = std::strerror(errno);
    unlink(temporary.c_str());
    throw CannotCreate(path, reason);
  }
  SyncPath(Directory(path), O_RDONLY | O_DIRECTORY);
}

sqlite3* OpenHostFile(const std::string& path) {
  struct stat info;
  if (stat(path.c_str(), &info) != 0) throw CannotOpen(path, std::strerror(errno));
  if (S_ISDIR(info.st_mode)) throw CannotOpen(path, "is a directory");
  if (S_ISREG(info.st_mode) && info.st_size == 0) {
    throw CannotOpen(path, "not a host database (empty file)");
  }
  sqlite3* db = nullptr;
  if (sqlite3_open_v2(path.c_str(), &db, SQLITE_OPEN_READWRITE, nullptr) != SQLITE_OK) {
    const std::string cause = db != nullptr ? sqlite3_errmsg(db) : "out of memory";
    sqlite3_close(db);
    throw CannotOpen(path, cause);
  }
  try {
    Check(db, path);
    char* error = nullptr;
    const std::string settings =
        "PRAGMA synchronous=FULL; PRAGMA busy_timeout=" + std::to_string(kBusyTimeoutMs) + ";";
    if (sqlite3_exec(db, settings.c_str(), nullptr, nullptr, &error) != SQLITE_OK) {
      const std::string cause = error != nullptr ? error : "";
      sqlite3_free(error);
      throw CannotOpen(path, cause);
    }
  } catch (...) {
    sqlite3_close(db);
    throw;
  }
  return db;
}

}  // namespace TarnCtl::Detail
