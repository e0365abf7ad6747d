// A connection to one host database, and the statements run on it.
//
// Contracts:
//  - Prepare() hands out a statement from the connection's cache (keyed by
//    the SQL text); the handle resets and unbinds it when it goes.
//    REQUIRES: no two live handles of the same SQL text (asserted in debug
//    builds).
//  - Every database failure is a HostCtlException whose message names the
//    database file ("Host database <path>: <cause>") and whose detailed
//    message starts with the label set by set_context(), when there is one
//    (the library operation that is running).
//  - Transactions (transaction.h) nest: the outermost is a real transaction,
//    inner ones are savepoints. depth() tells how deep the caller is.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "hostctl/exception.h"
#include "tarnctl/store/errors_made.h"

struct sqlite3;
struct sqlite3_stmt;

namespace TarnCtl::Store {

class Db;

class Statement {
 public:
  Statement(Statement&& other) noexcept;
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;
  ~Statement();

  // Parameters are numbered from 1.
  Statement& Bind(int index, int64_t value);
  Statement& Bind(int index, const std::string& value);
  // Binds `value` without a copy of its own.
  // REQUIRES: `value` outlives this handle (the binding goes with it).
  Statement& BindView(int index, std::string_view value);
  Statement& BindNull(int index);

  // Advances to the next row: true while a row is available.
  bool Step();
  // Steps until the statement is done.
  void Run();

  // Columns are numbered from 0.
  int64_t Int(int column) const;
  std::string Text(int column) const;
  bool IsNull(int column) const;
  bool IsInteger(int column) const;

 private:
  friend class Db;
  struct Cached;
  Statement(Db& db, Cached* cached);

  Db* db_;
  Cached* cached_;
};

// An error of the database: the library's exception, with the operation
// that was running (empty when none was), whose name leads the detailed
// message and never the message.
class DbError : public HostCtl::Lib::HostCtlException {
 public:
  DbError(const std::string& operation, const std::string& message)
      : HostCtlException(message, operation.empty() ? message : operation + ": " + message),
        operation_(operation) {
    NoteErrorMade(message);
  }
  const std::string& operation() const { return operation_; }

 private:
  std::string operation_;
};

// A database failure: a DbError with what kind of failure it was and
// SQLite's text for it.
class DbFailure : public DbError {
 public:
  enum class Kind { kNone, kIo, kFull, kPermission, kCorrupt, kNotADatabase, kBusy, kOther };
  DbFailure(DbError error, Kind kind, std::string cause)
      : DbError(std::move(error)), kind_(kind), cause_(std::move(cause)) {}
  Kind kind() const { return kind_; }
  const std::string& cause() const { return cause_; }

 private:
  Kind kind_;
  std::string cause_;
};

class Db {
 public:
  // How OpenFile opens a file.
  enum class Access {
    kWrite,  // read-write; a file that cannot be opened so is an error, not
             // opened read-only behind the caller's back
    kRead,   // read-only, and trusting that nobody changes the file while it
             // is open (the caller holds its lock): no log, nothing created
  };
  // Opens the existing database file `file`; `path` is how messages name
  // it. The busy timeout is set before anything is read.
  static std::unique_ptr<Db> OpenFile(const std::string& file, const std::string& path,
                                      Access access = Access::kWrite);
  // A private database in memory, named `name` in messages.
  static std::unique_ptr<Db> OpenMemory(const std::string& name);

  ~Db();
  Db(const Db&) = delete;
  Db& operator=(const Db&) = delete;

  const std::string& path() const { return path_; }

  // Commits through a write-ahead log beside the file, copied into the file
  // after every commit (host_vfs.h tells why that costs two syncs a
  // change), and copies in what a killed run committed and did not copy.
  // A file this process cannot write is only read, as SQLite reads it.
  // `logged`: the file's header says it is in write-ahead mode; only then is
  // the log's header trusted to reach the disk with its frames (host_vfs.h).
  // A log that cannot be copied in now is left for the next commit's copy
  // (reads go through it meanwhile): a host on a full disk can be read.
  // REQUIRES: right after OpenFile with Access::kWrite, before anything
  // else is read.
  void UseLog(bool logged);
  // For a change that rewrites the whole host (a load): a page cache that
  // holds it (up to 64 MiB), so that its pages go to the log once rather
  // than spilling there and being read back.
  void PrepareBulkChange();

  // Copies the host file, as the last commit left it, to the file `file`,
  // whole or not at all: into `file`.new beside it, synced, renamed over
  // `file` and the directory synced. The copy is a database file alone,
  // without a log. Refused for a database in memory, and while a commit
  // waits in the log, or once the open transaction changed anything (the
  // copy would miss it).
  void CopyTo(const std::string& file);
  // Makes the host the database file `file`, a copy that CopyTo made of a
  // host of this schema version, page by page in one commit of its own,
  // copied into the file as every commit is. Refuses another file and a
  // damaged one, leaving the host as it was. Counts as a change
  // (ChangeCount() moves on), so that copies of rows are read again.
  // REQUIRES: no transaction is open (the copy commits by itself).
  void ReplaceWith(const std::string& file);

  Statement Prepare(const std::string& sql);
  // Runs SQL without results (several statements allowed).
  void Exec(const std::string& sql);
  // The steps of SQLite's plan for `sql`, one line each (for the check
  // that no statement scans a growing table).
  std::vector<std::string> QueryPlan(const std::string& sql);

  // Rows inserted, changed or deleted through this connection so far.
  // Lets callers keep copies of rows and notice that they may be stale.
  int64_t ChangeCount() const;
  // Rows the last finished statement inserted, changed or deleted.
  int64_t LastChanges() const;
  // A number no other connection of this process had: caches keyed by a
  // connection survive its address being reused.
  uint64_t serial() const { return serial_; }

  // What is running, for the detailed message of database errors (not
  // owned; nullptr: nothing).
  const char* context() const { return context_; }
  void set_context(const char* context) { context_ = context; }

  // Transaction nesting (transaction.h keeps it).
  int depth() const { return depth_; }
  // Whether SQLite holds a transaction open. False inside a Transaction
  // when SQLite ended it by itself (an I/O error or a full disk rolls it
  // back).
  bool InTransaction() const;
  // After a failed commit: whether it was made, and only its copy from
  // the log into the file failed.
  bool CommitWaitsInLog() const { return copyFailed_ != 0 && !InTransaction(); }

  // What kind of failure the last failed call of this connection met.
  using Failure = DbFailure::Kind;
  Failure LastFailure() const;

  // Called with the SQL text and context() of every statement a
  // connection of this process prepares, once per connection (for the test
  // that checks every statement's query plan). Null: nothing is called.
  using Observer = void (*)(const std::string& sql, const char* context);
  static void Observe(Observer observer);

  // The database failure `cause` on this file.
  DbError Error(const std::string& cause) const;
  // Throws the last failure as a DbFailure, `more` added to its message.
  [[noreturn]] void Fail(const std::string& more = "") const;
  // SQLite's text for the last failure, with the reason the system gave
  // when it was an I/O error that SQLite reports as something else.
  std::string Cause() const;

 private:
  friend class Statement;
  friend class Transaction;
  Db(sqlite3* handle, std::string path);
  // Throws the last failure as that of a change that was not made.
  [[noreturn]] void FailNotMade() const;
  // Copies what the last commit left in the log into the file, as the
  // commit hook does; throws WaitingInLog() when that fails.
  void CopyCommitIn();
  // The failure of a commit that stands but whose copy from the log into
  // the file failed with SQLite code `copyFailed`.
  DbFailure WaitingInLog(int copyFailed) const;

  sqlite3* handle_;
  std::string path_;
  uint64_t serial_;
  uint64_t ioFailuresAtOpen_;  // IoFailures() when it was opened
  bool readOnly_ = false;      // opened with Access::kRead
  const char* context_ = nullptr;
  int depth_ = 0;
  int64_t changesAtBegin_ = 0;  // ChangeCount() when the outermost transaction began
  // The copy of the log into the file after the last commit failed with
  // this SQLite code (0: it did not fail); set by the commit hook.
  int copyFailed_ = 0;
  int64_t replacements_ = 0;  // ReplaceWith() calls, which SQLite counts no change of
  struct Cache;
  std::unique_ptr<Cache> cache_;
};

// `sql` with its first two parameters bound to a layer and a name: the key
// of most rows.
Statement Keyed(Db& db, const std::string& sql, int64_t layer, const std::string& name);

}  // namespace TarnCtl::Store
