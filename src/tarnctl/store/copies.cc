// Whole copies of a host database: written to a file of their own, and read
// back into a host in place of its tables.
#include <fcntl.h>
#include <sqlite3.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cassert>
#include <cerrno>
#include <cstring>

#include "tarnctl/store/db.h"
#include "tarnctl/store/schema.h"

namespace TarnCtl::Store {

namespace {

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

void Db::ReplaceWith(const std::string& file) {
  assert(depth_ == 0 && !InTransaction());
  const std::string unchanged = "; the host was not changed";
  // The host's lock keeps its snapshots as they are while it is held.
  std::unique_ptr<Db> copy;
  std::string id, version, check;
  try {
    copy = OpenFile(file, file, Access::kRead);
    auto pragma = [&](const char* name) {
      auto statement = copy->Prepare(std::string("PRAGMA ") + name);
      return statement.Step() ? statement.Text(0) : std::string();
    };
    id = pragma("application_id");
    version = pragma("user_version");
    // Pages are copied as they are: a damaged page would become the host's.
    if (id == std::to_string(kApplicationId)) check = pragma("quick_check");
    // The first problem, without the line naming the database ("*** in
    // database main ***") that comes before it.
    if (check.rfind("***", 0) == 0) check.erase(0, check.find('\n') + 1);
  } catch (const DbFailure& failure) {
    throw Error("cannot read " + file + " (" + failure.cause() + ")" + unchanged);
  }
  if (id != std::to_string(kApplicationId) || version != std::to_string(kSchemaVersion)) {
    throw Error(file + " is not a copy of a host of schema version " +
                std::to_string(kSchemaVersion) + unchanged);
  }
  if (check != "ok") throw Error(file + " is damaged (" + check + ")" + unchanged);
  sqlite3_backup* backup = sqlite3_backup_init(handle_, "main", copy->handle_, "main");
  if (backup == nullptr) FailNotMade();
  const int rc = sqlite3_backup_step(backup, -1);
  // Leaves the step's failure, if any, as this connection's last one.
  sqlite3_backup_finish(backup);
  if (rc != SQLITE_DONE) FailNotMade();
  ++replacements_;
  CopyCommitIn();
}

}  // namespace TarnCtl::Store
