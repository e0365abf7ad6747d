// How SQLite reaches a host file: the system's own file layer, told two
// things it cannot know by itself about the way the store uses the log, and
// watched for failures of the system's calls.
//
// A change is committed to the write-ahead log beside the host file
// (`<file>-wal`) and copied into the file at once (SQLite's commit hook,
// set by Db::UseLog), after which the log is emptied. So:
//  - The log holds at most one transaction when a new one starts it again.
//    A log left half-rewritten by a power failure can only bring back that
//    transaction, which the file already holds: the log's header needs no
//    sync of its own before its frames (SQLite's protection against a
//    stale log with several transactions, of which it would replay the
//    first). The header reaches the disk with the frames, synced before the
//    file is written.
//  - The log is kept, empty, between runs: once created (and its directory
//    synced then), opening it again needs no sync of the directory.
// A change then costs two syncs: the log, then the file.
//
// REQUIRES for the first point: the connection is in write-ahead mode
// (the file's header says so before SQLite reads it: a switch to that mode
// is itself a rollback-journal transaction whose syncs all count), locked
// exclusively, and copies the log in after every commit; Db::UseLog sets
// that up, and gives TrustLog() back (DistrustLog) when the mode is not
// confirmed.
//
// A file asked for read-write that the system would only open read-only
// (SQLite then falls back to reading it, and fails later as "readonly") is
// not opened: the open fails as the I/O error it was.
#pragma once

#include <cstdint>

struct sqlite3;

namespace TarnCtl::Store {

// The name to open host files with (sqlite3_open_v2's zVfs); registered on
// the first call.
const char* HostVfsName();

// Tells SQLite that the log of `db`'s main file needs no header sync (see
// above). Takes effect when the log is opened: call it before the first read.
// REQUIRES: the file is in write-ahead mode.
void TrustLog(sqlite3* db);

// Undoes TrustLog(), for a connection left in rollback-journal mode (a file
// the library cannot switch to write-ahead logging): there every sync
// counts.
void DistrustLog(sqlite3* db);

// How many calls of the system's file layer (reads, writes, syncs, size
// changes, locks) have failed in this process so far: a failure SQLite then
// reports as a damaged file was an I/O error.
uint64_t IoFailures();

}  // namespace TarnCtl::Store
