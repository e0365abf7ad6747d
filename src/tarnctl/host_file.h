// The host database file and its lock, below the session.
//
//  - The lock is an exclusive flock on "<path>.lock". LockHost polls for it
//    for TARN_LOCK_TIMEOUT seconds (default 30; 0: one try) and then throws
//    "Host <path> is busy: another process holds its lock".
//  - CreateHostFile builds a new host (schema and the default host) in
//    "<path>.new" and renames it to `path`: a crash leaves either no host
//    file or a whole one.
//  - OpenHostFile opens an existing file read-write without creating it and
//    checks it before anything is written: not empty, application id
//    kApplicationId, user_version 1..kSchemaVersion. A file that fails is
//    refused with "Cannot open host database <path>: <cause>" and is left
//    exactly as it was.
#pragma once

#include <string>

struct sqlite3;

namespace TarnCtl::Detail {

// Creates the directories above `path` that are missing (best effort).
void PrepareDirectory(const std::string& path);
// Takes the host's lock; returns the descriptor that holds it.
int LockHost(const std::string& path);
// False only when nothing exists at `path`.
bool HostFileExists(const std::string& path);
void CreateHostFile(const std::string& path);
sqlite3* OpenHostFile(const std::string& path);

}  // namespace TarnCtl::Detail
