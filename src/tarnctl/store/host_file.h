// An open host: its database file, the lock on that file, and the
// connection to it.
//
//  - The lock is an exclusive flock on the database file itself, so every
//    path that reaches the file (a symbolic or a hard link) shares it.
//    Open() polls for it for `lockTimeoutSeconds` (0: one try) and then
//    throws "Host <path> is busy: another process holds its lock".
//  - Before SQLite sees a file, Open() reads its header and refuses
//    ("Cannot open host database <path>: <cause>; <what to do>") anything
//    that is not a host database of a version this library knows: another
//    application's SQLite file (whatever journal or log lies beside it), a
//    newer schema, a directory, a device. Such a file is left exactly as it
//    was and nothing is created beside it.
//  - A missing or empty file is no host yet: with `create`, Open() builds
//    the default host in it in one transaction (a crash leaves an empty
//    file, which the next Open() fills) and created() says so.
//  - SQLite names its journal after the path it opened, so every open of
//    one file must use the same path: symbolic links are resolved, and of
//    several hard links in one directory the first name (in byte order) is
//    used. A file with a hard link in another directory is refused.
#pragma once

#include <memory>
#include <string>

#include "tarnctl/store/db.h"
#include "tarnctl/store/location.h"

namespace TarnCtl::Store {

struct OpenOptions {
  int lockTimeoutSeconds = 30;
  // Make the default host in a missing or empty file; without it, such a
  // file is refused as "no host yet".
  bool create = true;
};

// The log beside the host file `path` when a commit waits there to be
// copied into the file (a copy failed, or a run was killed after its
// commit); empty when none does. Reads only the log's size: a run that is
// committing right now has one there for a moment.
std::string WaitingLog(const std::string& path);

// TARN_LOCK_TIMEOUT's value as seconds (0 to 86400); the default for
// anything else.
int LockTimeoutFrom(const char* text);

class HostFile {
 public:
  static std::unique_ptr<HostFile> Open(const Location& location, const OpenOptions& options);
  ~HostFile();  // closes the connection, then lets go of the lock
  HostFile(const HostFile&) = delete;
  HostFile& operator=(const HostFile&) = delete;

  Db& db() { return *db_; }
  // The file as the user named it.
  const std::string& path() const { return path_; }
  // True when this Open() made the host.
  bool created() const { return created_; }

  // In a forked child: drop this process's hold on the lock descriptor
  // without touching the lock, which stays the parent's.
  void ForgetLockInChild();

 private:
  HostFile(std::string path, int lockFd, std::unique_ptr<Db> db, bool created);

  std::string path_;
  int lockFd_;
  std::unique_ptr<Db> db_;
  bool created_;
};

}  // namespace TarnCtl::Store
