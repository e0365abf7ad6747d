// The connection: a statement cache and SQLite's errors turned into the
// library's exception.
#include "tarnctl/store/db.h"

#include <sqlite3.h>
#include <sys/stat.h>

#include <atomic>
#include <cassert>
#include <cstdio>
#include <string_view>
#include <unordered_map>

#include "tarnctl/store/host_vfs.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Store {

using HostCtl::Lib::HostCtlException;

namespace {

// Waits this long for another connection's SQLite lock (another program
// opening the file with SQLite itself) before failing as busy.
constexpr int kBusyTimeoutMs = 5000;

std::atomic<uint64_t> g_serials{0};
Db::Observer g_observer = nullptr;

// A process of this library uses its connections from one thread at a time
// (the host's lock admits one process, and the programs are single
// threaded): SQLite's own mutexes and memory statistics would only cost.
// The page cache takes its pages one at a time as they are read: by default
// it sets out room for 20 at the first page, writing into every one of them,
// and most runs read fewer (docs/performance.md has the figures).
// REQUIRES: before the first connection; runs once.
void ConfigureOnce() {
  static const bool configured = [] {
    sqlite3_config(SQLITE_CONFIG_SINGLETHREAD);
    sqlite3_config(SQLITE_CONFIG_MEMSTATUS, 0);
    sqlite3_config(SQLITE_CONFIG_PAGECACHE, nullptr, 0, 0);
    return true;
  }();
  (void)configured;
}

// Copies the write-ahead log into the file, syncing both, and empties it.
// A copy that fails leaves the log as it is for the next program, which
// copies it in: not copied at close, after a sync that just failed.
int CopyLogIn(sqlite3* handle) {
  const int rc =
      sqlite3_wal_checkpoint_v2(handle, nullptr, SQLITE_CHECKPOINT_TRUNCATE, nullptr, nullptr);
  if (rc != SQLITE_OK) sqlite3_db_config(handle, SQLITE_DBCONFIG_NO_CKPT_ON_CLOSE, 1, nullptr);
  return rc;
}

Db::Failure FailureOf(int code) {
  switch (code & 0xff) {
    case SQLITE_OK:
    case SQLITE_ROW:
    case SQLITE_DONE:
      return Db::Failure::kNone;
    case SQLITE_IOERR:
      return Db::Failure::kIo;
    case SQLITE_FULL:
      return Db::Failure::kFull;
    case SQLITE_READONLY:
    case SQLITE_PERM:
    case SQLITE_CANTOPEN:
    case SQLITE_AUTH:
      return Db::Failure::kPermission;
    case SQLITE_CORRUPT:
      return Db::Failure::kCorrupt;
    case SQLITE_NOTADB:
      return Db::Failure::kNotADatabase;
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
      return Db::Failure::kBusy;
    default:
      return Db::Failure::kOther;
  }
}

}  // namespace

struct Statement::Cached {
  sqlite3_stmt* stmt = nullptr;
  bool inUse = false;
};

struct Db::Cache {
  std::unordered_map<std::string, std::unique_ptr<Statement::Cached>> statements;
};

// --- Statement ---

Statement::Statement(Db& db, Cached* cached) : db_(&db), cached_(cached) {
  assert(!cached_->inUse && "two live handles of one statement");
  cached_->inUse = true;
}

Statement::Statement(Statement&& other) noexcept : db_(other.db_), cached_(other.cached_) {
  other.cached_ = nullptr;
}

Statement::~Statement() {
  if (cached_ == nullptr) return;
  sqlite3_reset(cached_->stmt);
  sqlite3_clear_bindings(cached_->stmt);
  cached_->inUse = false;
}

Statement& Statement::Bind(int index, int64_t value) {
  if (sqlite3_bind_int64(cached_->stmt, index, value) != SQLITE_OK) db_->Fail();
  return *this;
}

Statement& Statement::Bind(int index, const std::string& value) {
  if (sqlite3_bind_text(cached_->stmt, index, value.data(), static_cast<int>(value.size()),
                        SQLITE_TRANSIENT) != SQLITE_OK) {
    db_->Fail();
  }
  return *this;
}

Statement& Statement::BindView(int index, std::string_view value) {
  if (sqlite3_bind_text(cached_->stmt, index, value.data(), static_cast<int>(value.size()),
                        SQLITE_STATIC) != SQLITE_OK) {
    db_->Fail();
  }
  return *this;
}

Statement& Statement::BindNull(int index) {
  if (sqlite3_bind_null(cached_->stmt, index) != SQLITE_OK) db_->Fail();
  return *this;
}

bool Statement::Step() {
  const int rc = sqlite3_step(cached_->stmt);
  if (rc == SQLITE_ROW) return true;
  if (rc == SQLITE_DONE) return false;
  db_->Fail();
}

void Statement::Run() {
  while (Step()) {
  }
}

int64_t Statement::Int(int column) const {
  return sqlite3_column_int64(cached_->stmt, column);
}

std::string Statement::Text(int column) const {
  const auto* text = sqlite3_column_text(cached_->stmt, column);
  if (text == nullptr) return {};
  return std::string(reinterpret_cast<const char*>(text),
                     sqlite3_column_bytes(cached_->stmt, column));
}

bool Statement::IsNull(int column) const {
  return sqlite3_column_type(cached_->stmt, column) == SQLITE_NULL;
}

bool Statement::IsInteger(int column) const {
  return sqlite3_column_type(cached_->stmt, column) == SQLITE_INTEGER;
}

// --- Db ---

Db::Db(sqlite3* handle, std::string path)
    : handle_(handle),
      path_(std::move(path)),
      serial_(++g_serials),
      ioFailuresAtOpen_(IoFailures()),
      cache_(new Cache) {}

Db::~Db() {
  for (auto& [sql, cached] : cache_->statements) sqlite3_finalize(cached->stmt);
  sqlite3_close_v2(handle_);
}

std::unique_ptr<Db> Db::OpenFile(const std::string& file, const std::string& path, Access access) {
  ConfigureOnce();
  sqlite3* handle = nullptr;
  int rc;
  if (access == Access::kWrite) {
    rc = sqlite3_open_v2(file.c_str(), &handle, SQLITE_OPEN_READWRITE, HostVfsName());
  } else {
    // Immutable: SQLite then reads the file alone, takes no lock of its own
    // and creates nothing beside it; the host's lock keeps writers out.
    std::string uri = "file:";
    for (const char c : file) {
      if (c == '%' || c == '?' || c == '#') {
        char escaped[4];
        std::snprintf(escaped, sizeof escaped, "%%%02X", static_cast<unsigned char>(c));
        uri += escaped;
      } else {
        uri += c;
      }
    }
    uri += "?immutable=1";
    rc = sqlite3_open_v2(uri.c_str(), &handle, SQLITE_OPEN_READONLY | SQLITE_OPEN_URI,
                         HostVfsName());
  }
  if (handle != nullptr) sqlite3_busy_timeout(handle, kBusyTimeoutMs);
  std::unique_ptr<Db> db(new Db(handle, path));
  db->readOnly_ = access == Access::kRead;
  if (rc != SQLITE_OK) db->Fail();
  sqlite3_extended_result_codes(handle, 1);
  // Temporary data (the statement journal of a large change, sorts) stays
  // in memory, not in a directory elsewhere that may be full or missing.
  db->Exec("PRAGMA temp_store=MEMORY");
  return db;
}

std::unique_ptr<Db> Db::OpenMemory(const std::string& name) {
  ConfigureOnce();
  sqlite3* handle = nullptr;
  const int rc = sqlite3_open_v2(":memory:", &handle, SQLITE_OPEN_READWRITE, nullptr);
  std::unique_ptr<Db> db(new Db(handle, name));
  if (rc != SQLITE_OK) db->Fail();
  return db;
}

void Db::UseLog(bool logged) {
  assert(sqlite3_db_readonly(handle_, "main") == 0);
  if (logged) TrustLog(handle_);
  // Locked exclusively before the log is first read: the log's index then
  // lives in this process's memory, not in a third file beside the host.
  Exec("PRAGMA locking_mode=EXCLUSIVE");
  sqlite3_stmt* stmt = nullptr;
  if (sqlite3_prepare_v2(handle_, "PRAGMA journal_mode=WAL", -1, &stmt, nullptr) != SQLITE_OK) {
    Fail();
  }
  const int rc = sqlite3_step(stmt);
  const bool inLog =
      rc == SQLITE_ROW &&
      std::string_view(reinterpret_cast<const char*>(sqlite3_column_text(stmt, 0))) == "wal";
  sqlite3_finalize(stmt);
  if (rc != SQLITE_ROW) Fail();
  if (!inLog) {  // not expected of a file open for writing; every sync counts then
    DistrustLog(handle_);
    Exec("PRAGMA locking_mode=NORMAL; PRAGMA synchronous=FULL");
    return;
  }
  int persist = 1;
  sqlite3_file_control(handle_, "main", SQLITE_FCNTL_PERSIST_WAL, &persist);
  // Syncs are the copy's, after each commit: the commit itself need not
  // sync a log that is synced before the run ends. The log is emptied also
  // when the run closes it (after a rollback, which leaves frames).
  Exec("PRAGMA synchronous=NORMAL; PRAGMA journal_size_limit=0");
  // The copy runs after each commit that wrote to the log, in SQLite's
  // commit hook: its error is the commit's, though the commit stands. (The
  // hook replaces SQLite's own checkpoints, and is replaced by any
  // wal_autocheckpoint pragma.)
  sqlite3_wal_hook(
      handle_,
      [](void* self, sqlite3* handle, const char*, int) {
        const int rc = CopyLogIn(handle);
        static_cast<Db*>(self)->copyFailed_ = rc;
        return rc;
      },
      this);
  struct stat log;
  if (stat((std::string(sqlite3_db_filename(handle_, "main")) + "-wal").c_str(), &log) == 0 &&
      log.st_size > 0) {
    // What a killed run or a failed copy left: copied in now, or by this
    // run's first commit. The log stays valid until a copy succeeds.
    CopyLogIn(handle_);
  }
}

void Db::PrepareBulkChange() {
  Exec("PRAGMA cache_size=-65536");
}

Statement Db::Prepare(const std::string& sql) {
  auto found = cache_->statements.find(sql);
  if (found != cache_->statements.end()) return Statement(*this, found->second.get());
  if (g_observer != nullptr) g_observer(sql, context_);
  auto cached = std::make_unique<Statement::Cached>();
  if (sqlite3_prepare_v3(handle_, sql.c_str(), static_cast<int>(sql.size()),
                         SQLITE_PREPARE_PERSISTENT, &cached->stmt, nullptr) != SQLITE_OK) {
    Fail();
  }
  Statement::Cached* raw = cached.get();
  cache_->statements.emplace(sql, std::move(cached));
  return Statement(*this, raw);
}

void Db::Observe(Observer observer) {
  g_observer = observer;
}

void Db::Exec(const std::string& sql) {
  if (sqlite3_exec(handle_, sql.c_str(), nullptr, nullptr, nullptr) != SQLITE_OK) Fail();
}

std::vector<std::string> Db::QueryPlan(const std::string& sql) {
  sqlite3_stmt* stmt = nullptr;
  const std::string explain = "EXPLAIN QUERY PLAN " + sql;
  if (sqlite3_prepare_v2(handle_, explain.c_str(), -1, &stmt, nullptr) != SQLITE_OK) Fail();
  std::vector<std::string> steps;
  while (sqlite3_step(stmt) == SQLITE_ROW) {
    steps.emplace_back(reinterpret_cast<const char*>(sqlite3_column_text(stmt, 3)));
  }
  sqlite3_finalize(stmt);
  return steps;
}

bool Db::InTransaction() const {
  return sqlite3_get_autocommit(handle_) == 0;
}

Db::Failure Db::LastFailure() const {
  if (handle_ == nullptr) return Failure::kOther;
  const Failure failure = FailureOf(sqlite3_extended_errcode(handle_));
  // A read that failed can reach SQLite as a page it cannot make sense of.
  if ((failure == Failure::kCorrupt || failure == Failure::kNotADatabase) &&
      IoFailures() != ioFailuresAtOpen_) {
    return Failure::kIo;
  }
  return failure;
}

std::string Db::Cause() const {
  if (handle_ == nullptr) return "out of memory";
  const Failure failure = LastFailure();
  if (failure == Failure::kIo && FailureOf(sqlite3_extended_errcode(handle_)) != Failure::kIo) {
    return "disk I/O error";
  }
  if (readOnly_ && (sqlite3_extended_errcode(handle_) & 0xff) == SQLITE_READONLY) {
    return "this user can only read it (the file, its log or their directory is not writable)";
  }
  return sqlite3_errmsg(handle_);
}

int64_t Db::ChangeCount() const {
  return sqlite3_total_changes64(handle_) + replacements_;
}

int64_t Db::LastChanges() const {
  return sqlite3_changes64(handle_);
}

DbError Db::Error(const std::string& cause) const {
  return DbError(context_ != nullptr ? context_ : "", "Host database " + path_ + ": " + cause);
}

void Db::Fail(const std::string& more) const {
  const std::string cause = Cause();
  throw DbFailure(Error(cause + more), LastFailure(), cause);
}

void Db::FailNotMade() const {
  const bool full = LastFailure() == Failure::kFull;
  Fail(std::string("; the change was not made") + (full ? " (free space, then run it again)" : ""));
}

void Db::CopyCommitIn() {
  copyFailed_ = CopyLogIn(handle_);
  if (copyFailed_ != SQLITE_OK) throw WaitingInLog(copyFailed_);
}

DbFailure Db::WaitingInLog(int copyFailed) const {
  const bool full = FailureOf(copyFailed) == Failure::kFull;
  const std::string cause = full ? "database or disk is full" : "disk I/O error";
  return DbFailure(Error("the change was made, but copying it from the log into the host file "
                         "failed (" +
                         cause + "): it waits in " + sqlite3_db_filename(handle_, "main") +
                         "-wal, and the next program to open the host copies it in" +
                         (full ? " (free space first)" : "")),
                   FailureOf(copyFailed), cause);
}

Statement Keyed(Db& db, const std::string& sql, int64_t layer, const std::string& name) {
  auto statement = db.Prepare(sql);
  statement.Bind(1, layer).Bind(2, name);
  return statement;
}

// --- Transaction ---

Transaction::Transaction(Db& db) : db_(db), depth_(db.depth_) {
  // A savepoint outside SQLite's transaction would start one of its own and
  // commit alone: the run's transaction was ended by an earlier failure.
  if (depth_ > 0 && !db_.InTransaction()) {
    throw db_.Error("the run's earlier changes were undone after a failure");
  }
  db_.Exec(depth_ == 0 ? "BEGIN IMMEDIATE" : "SAVEPOINT inner");
  if (depth_ == 0) db_.changesAtBegin_ = db_.ChangeCount();
  ++db_.depth_;
}

Transaction::~Transaction() {
  if (done_) return;
  db_.depth_ = depth_;
  if (!db_.InTransaction()) return;  // SQLite ended it after a failure
  try {
    if (depth_ == 0) {
      db_.Exec("ROLLBACK");
    } else {
      db_.Exec("ROLLBACK TO inner");
      db_.Exec("RELEASE inner");
    }
  } catch (const HostCtlException&) {
    // SQLite may have ended the transaction itself (a full disk, an I/O
    // error); there is nothing left to undo then.
  }
}

void Transaction::Commit() {
  assert(db_.depth_ == depth_ + 1 && "commit of a transaction that is not the innermost");
  db_.copyFailed_ = 0;
  if (sqlite3_exec(db_.handle_, depth_ == 0 ? "COMMIT" : "RELEASE inner", nullptr, nullptr,
                   nullptr) != SQLITE_OK) {
    // Still open (busy): undone by the destructor. Else ended: rolled back,
    // or committed and then not copied into the file.
    const bool open = db_.InTransaction();
    if (!open) {
      db_.depth_ = depth_;
      done_ = true;
    }
    if (depth_ > 0) db_.Fail();
    if (open || db_.copyFailed_ == 0) db_.FailNotMade();
    throw db_.WaitingInLog(db_.copyFailed_);
  }
  db_.depth_ = depth_;
  done_ = true;
}

}  // namespace TarnCtl::Store
