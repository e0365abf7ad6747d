// The process's session: the host's lock, the database connection and its
// statement cache. Opening refuses, without touching it, any file that is
// not a host database of a version this library knows; a missing file is
// created whole in a temporary file and renamed into place.
#include "tarnctl/session.h"

#include <pthread.h>
#include <sqlite3.h>
#include <unistd.h>

#include <map>
#include <string>
#include <unordered_map>

#include "tarnctl/errors.h"
#include "tarnctl/host_file.h"
#include "tarnctl/schema.h"

namespace TarnCtl::Detail {

using HostCtl::Lib::HostCtlException;

namespace {

// The user's spelling of the database path of each open connection, for
// error messages.
std::map<sqlite3*, std::string>& Paths() {
  static std::map<sqlite3*, std::string> paths;
  return paths;
}

const std::string& PathOf(sqlite3* db) {
  static const std::string unknown = "(unknown)";
  auto found = Paths().find(db);
  return found == Paths().end() ? unknown : found->second;
}

[[noreturn]] void Fail(sqlite3* db) {
  throw DatabaseError(PathOf(db), sqlite3_errmsg(db));
}

// Open transactions of the process; inner ones are savepoints.
int g_transactionDepth = 0;

struct Shared {
  std::weak_ptr<Session> session;
  pid_t owner = 0;  // a forked child must not use its parent's session
};

Shared& Process() {
  static Shared shared;
  return shared;
}

}  // namespace

struct Session::Cache {
  std::unordered_map<std::string, sqlite3_stmt*> statements;
};

// --- Statement ---

Statement::Statement(Statement&& other) noexcept : db_(other.db_), stmt_(other.stmt_) {
  other.stmt_ = nullptr;
}

Statement::~Statement() {
  if (stmt_ == nullptr) return;
  sqlite3_reset(stmt_);
  sqlite3_clear_bindings(stmt_);
}

Statement& Statement::Bind(int index, int64_t value) {
  if (sqlite3_bind_int64(stmt_, index, value) != SQLITE_OK) Fail(db_);
  return *this;
}

Statement& Statement::Bind(int index, const std::string& value) {
  if (sqlite3_bind_text(stmt_, index, value.data(), static_cast<int>(value.size()),
                        SQLITE_TRANSIENT) != SQLITE_OK) {
    Fail(db_);
  }
  return *this;
}

Statement& Statement::BindNull(int index) {
  if (sqlite3_bind_null(stmt_, index) != SQLITE_OK) Fail(db_);
  return *this;
}

bool Statement::Step() {
  const int rc = sqlite3_step(stmt_);
  if (rc == SQLITE_ROW) return true;
  if (rc == SQLITE_DONE) return false;
  Fail(db_);
}

void Statement::Run() {
  while (Step()) {
  }
}

int64_t Statement::Int(int column) const {
  return sqlite3_column_int64(stmt_, column);
}

std::string Statement::Text(int column) const {
  const auto* text = sqlite3_column_text(stmt_, column);
  if (text == nullptr) return {};
  return std::string(reinterpret_cast<const char*>(text), sqlite3_column_bytes(stmt_, column));
}

bool Statement::IsNull(int column) const {
  return sqlite3_column_type(stmt_, column) == SQLITE_NULL;
}

// --- Session ---

Session::Session(std::string path, sqlite3* db, int lockFd)
    : path_(std::move(path)), db_(db), lockFd_(lockFd), cache_(std::make_unique<Cache>()) {
  Paths()[db_] = path_;
}

Session::~Session() {
  for (auto& [sql, stmt] : cache_->statements) sqlite3_finalize(stmt);
  Paths().erase(db_);
  sqlite3_close_v2(db_);
  if (lockFd_ >= 0) close(lockFd_);  // releases the host's lock
}

std::shared_ptr<Session> Session::Current() {
  Shared& shared = Process();
  if (shared.owner != getpid()) return nullptr;
  return shared.session.lock();
}

std::shared_ptr<Session> Session::Acquire() {
  if (auto current = Current()) return current;
  Shared& shared = Process();
  if (shared.owner != 0 && shared.owner != getpid()) {
    // A forked child's copy of its parent's session stays untouched: its
    // connection and lock belong to the parent.
    new std::weak_ptr<Session>(std::move(shared.session));
    shared.session.reset();
  }

  const std::string path = HostDatabasePath();
  PrepareDirectory(path);
  const int lockFd = LockHost(path);
  sqlite3* db = nullptr;
  try {
    if (!HostFileExists(path)) CreateHostFile(path);
    db = OpenHostFile(path);
  } catch (...) {
    close(lockFd);
    throw;
  }
  std::shared_ptr<Session> session(new Session(path, db, lockFd));
  shared.session = session;
  shared.owner = getpid();
  // A forked child lets go of its copy of the lock descriptor, so that the
  // parent's release is a release (flock locks belong to the descriptor).
  static const bool registered = [] {
    pthread_atfork(nullptr, nullptr, [] {
      if (auto parent = Process().session.lock(); parent && parent->lockFd_ >= 0) {
        close(parent->lockFd_);
        parent->lockFd_ = -1;
      }
    });
    return true;
  }();
  (void)registered;
  return session;
}

Statement Session::Prepare(const char* sql) {
  auto found = cache_->statements.find(sql);
  if (found != cache_->statements.end()) return Statement(db_, found->second);
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v3(db_, sql, -1, SQLITE_PREPARE_PERSISTENT, &stmt, nullptr) != SQLITE_OK) {
    Fail(db_);
  }
  cache_->statements.emplace(sql, stmt);
  return Statement(db_, stmt);
}

void Session::Exec(const char* sql) {
  if (sqlite3_exec(db_, sql, nullptr, nullptr, nullptr) != SQLITE_OK) Fail(db_);
}

int64_t Session::NextSeq() {
  Statement next = Prepare(
      "UPDATE meta SET value = CAST(value AS INTEGER) + 1 WHERE key = 'next_seq' "
      "RETURNING CAST(value AS INTEGER) - 1");
  if (!next.Step()) throw DatabaseError(path_, "the ordering counter is missing");
  const int64_t value = next.Int(0);
  next.Run();
  return value;
}

int64_t Session::ChangeCount() const {
  return sqlite3_total_changes64(db_);
}

// --- Transaction ---

Transaction::Transaction(Session& session) : session_(session) {
  session_.Exec(g_transactionDepth == 0 ? "BEGIN IMMEDIATE" : "SAVEPOINT inner");
  ++g_transactionDepth;
}

Transaction::~Transaction() {
  if (done_) return;
  --g_transactionDepth;
  try {
    if (g_transactionDepth == 0) {
      session_.Exec("ROLLBACK");
    } else {
      session_.Exec("ROLLBACK TO inner");
      session_.Exec("RELEASE inner");
    }
  } catch (const HostCtlException&) {
    // SQLite may have ended the transaction itself (a full disk, an I/O
    // error); there is nothing left to undo then.
  }
}

void Transaction::Commit() {
  session_.Exec(g_transactionDepth == 1 ? "COMMIT" : "RELEASE inner");
  --g_transactionDepth;
  done_ = true;
}

}  // namespace TarnCtl::Detail
