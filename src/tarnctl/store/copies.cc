// Whole copies of a host database: written to a file of their own, and read
// back into a host in place of its tables.
#include <fcntl.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "tarnctl/store/db.h"
#include "tarnctl/store/schema.h"

namespace TarnCtl::Store {

namespace {

// The name the copied file is attached under while its rows are read.
constexpr const char* kCopied = "copied";
// Where a database file's header keeps its format's write and read versions.
constexpr off_t kFormatVersionsOffset = 18;

std::string DirectoryOf(const std::string& file) {
  const auto slash = file.rfind('/');
  if (slash == std::string::npos) return ".";
  return slash == 0 ? "/" : file.substr(0, slash);
}

bool Sync(const std::string& path, int flags) {
  const int fd = open(path.c_str(), flags | O_CLOEXEC);
  if (fd < 0) return false;
  const bool synced = fsync(fd) == 0;
  const int error = errno;
  close(fd);
  errno = error;
  return synced;
}

}  // namespace

void Db::CopyTo(const std::string& file) {
  const char* name = sqlite3_db_filename(handle_, "main");
  const std::string host = name != nullptr ? name : "";
  if (host.empty()) throw Error("a host in memory has no file to copy");
  if (depth_ > 0 && ChangeCount() != changesAtBegin_) {
    throw Error("cannot copy it with changes not committed yet");
  }
  // Between runs the file alone holds the host; a commit that waits in the
  // log (its copy into the file failed) would be missing from the copy.
  struct stat log;
  if (stat((host + "-wal").c_str(), &log) == 0 && log.st_size > 0) {
    throw Error("cannot copy it while a commit waits in its log " + host +
                "-wal (the next change copies it in)");
  }
  const std::string building = file + ".new";
  int from = -1, to = -1;
  auto fail = [&](const std::string& cause) {
    if (from >= 0) close(from);
    if (to >= 0) close(to);
    unlink(building.c_str());
    throw Error("cannot write a copy to " + file + ": " + cause);
  };
  from = open(host.c_str(), O_RDONLY | O_CLOEXEC);
  if (from < 0) fail(std::strerror(errno));
  to = open(building.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
  if (to < 0) fail(std::strerror(errno));
  char buffer[1 << 16];
  ssize_t n;
  while ((n = read(from, buffer, sizeof buffer)) != 0) {
    if (n < 0) {
      if (errno == EINTR) continue;
      fail(std::strerror(errno));
    }
    for (ssize_t done = 0; done < n;) {
      const ssize_t w = write(to, buffer + done, n - done);
      if (w < 0 && errno != EINTR) fail(std::strerror(errno));
      if (w > 0) done += w;
    }
  }
  // The host's header says that it keeps a log; the copy stands alone
  // (the file format's write and read versions, 1: a rollback journal).
  const unsigned char versions[2] = {1, 1};
  if (pwrite(to, versions, 2, kFormatVersionsOffset) != 2) fail(std::strerror(errno));
  if (fsync(to) != 0) fail(std::strerror(errno));
  close(from);
  from = -1;
  if (close(to) != 0) {
    to = -1;
    fail(std::strerror(errno));
  }
  to = -1;
  if (rename(building.c_str(), file.c_str()) != 0) fail(std::strerror(errno));
  if (!Sync(DirectoryOf(file), O_RDONLY | O_DIRECTORY)) {
    throw Error("cannot sync the directory of " + file + ": " + std::strerror(errno));
  }
}

void Db::CopyTablesFrom(const std::string& file, const std::vector<std::string>& tables) {
  // A file attached by an earlier call whose transaction has ended.
  if (sqlite3_db_filename(handle_, kCopied) != nullptr) {
    Exec(std::string("DETACH ") + kCopied);
  }
  // Run here rather than prepared through the statement cache: these name
  // a database that only this call attaches.
  sqlite3_stmt* statement = nullptr;
  auto step = [&](const std::string& sql, const std::string* text) {
    int64_t value = -1;
    if (sqlite3_prepare_v2(handle_, sql.c_str(), -1, &statement, nullptr) != SQLITE_OK) Fail();
    if (text != nullptr) sqlite3_bind_text(statement, 1, text->c_str(), -1, SQLITE_STATIC);
    const int rc = sqlite3_step(statement);
    if (rc == SQLITE_ROW) value = sqlite3_column_int64(statement, 0);
    sqlite3_finalize(statement);
    if (rc != SQLITE_ROW && rc != SQLITE_DONE) Fail();
    return value;
  };
  step(std::string("ATTACH ?1 AS ") + kCopied, &file);
  // Read through a mapping: no system call a page.
  Exec(std::string("PRAGMA ") + kCopied + ".mmap_size=1073741824");
  auto pragma = [&](const char* name) {
    return step(std::string("PRAGMA ") + kCopied + "." + name, nullptr);
  };
  if (pragma("application_id") != kApplicationId || pragma("user_version") != kSchemaVersion) {
    throw Error(file + " is not a copy of a host of schema version " +
                std::to_string(kSchemaVersion));
  }
  // Same tables, same columns: SQLite copies the rows as they are stored.
  for (const std::string& table : tables) {
    Exec("DELETE FROM main." + table + "; INSERT INTO main." + table + " SELECT * FROM " + kCopied +
         "." + table);
  }
}

}  // namespace TarnCtl::Store
