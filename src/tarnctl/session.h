// A process's connection to the host database, and the host's lock.
//
// Contracts:
//  - One Session per process at a time. Session::Acquire() opens it on first
//    use and hands out shared references; it closes (and releases the lock)
//    when the last reference goes. A process that ends through exit() or a
//    signal releases the lock with it (the lock is an flock on a file beside
//    the database).
//  - Opening takes the host's exclusive lock, waiting up to about 30 s for
//    another process to release it, and then throws HostCtlException with a
//    message that names the path and says that the host is busy.
//  - A missing database is created holding the default host. A database
//    that cannot be opened, is corrupt, belongs to another application, or
//    has a newer schema version is refused with a HostCtlException naming
//    the path and the cause; the file is never modified or replaced.
//  - Every change is made inside a Transaction and is durable once Commit()
//    returned.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

struct sqlite3;
struct sqlite3_stmt;

namespace TarnCtl::Detail {

// TARN_HOST_DB when set, else the default location (see docs/host.md).
std::string HostDatabasePath();

// A prepared statement borrowed from the session's cache; reset and
// unbound when the handle goes. Do not hold two handles of the same SQL
// text at once.
class Statement {
 public:
  Statement(sqlite3* db, sqlite3_stmt* stmt) : db_(db), stmt_(stmt) {}
  Statement(Statement&& other) noexcept;
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;
  ~Statement();

  // Parameters are numbered from 1.
  Statement& Bind(int index, int64_t value);
  Statement& Bind(int index, const std::string& value);
  Statement& BindNull(int index);

  // Advances to the next row: true while a row is available. Throws
  // HostCtlException on a database error.
  bool Step();
  // Steps until the statement is done.
  void Run();

  // Columns are numbered from 0.
  int64_t Int(int column) const;
  std::string Text(int column) const;
  bool IsNull(int column) const;

 private:
  sqlite3* db_;
  sqlite3_stmt* stmt_;
};

class Session {
 public:
  // The process's session, opened when none is open.
  static std::shared_ptr<Session> Acquire();
  // The open session, or nullptr.
  static std::shared_ptr<Session> Current();

  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  const std::string& path() const { return path_; }

  Statement Prepare(const char* sql);
  // Runs SQL without results (several statements allowed).
  void Exec(const char* sql);
  // The next value of the ordering counter (meta 'next_seq'); call inside
  // a transaction.
  int64_t NextSeq();
  // Rows inserted, changed or deleted through this session so far, in any
  // table. Lets the library keep copies of rows (and of the fault table)
  // and notice that they may be stale.
  int64_t ChangeCount() const;

 private:
  Session(std::string path, sqlite3* db, int lockFd);

  std::string path_;
  sqlite3* db_;
  int lockFd_;
  struct Cache;
  std::unique_ptr<Cache> cache_;
};

// BEGIN IMMEDIATE on construction; ROLLBACK on destruction unless
// Commit() was called.
class Transaction {
 public:
  explicit Transaction(Session& session);
  ~Transaction();
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  void Commit();

 private:
  Session& session_;
  bool done_ = false;
};

}  // namespace TarnCtl::Detail
