// The process's hold on its host: the open host file (with its lock) and
// the run's transaction.
//
// Contracts:
//  - One process's session at a time. Acquire() opens it on first use at
//    the location the environment names (TARN_HOST_DB and friends, read
//    here, at the library's edge; TARN_LOCK_TIMEOUT likewise) and hands out
//    shared references; it ends when the last reference goes. Other hosts
//    may be open beside it, each a session of its own (Open()).
//  - A session is one transaction. Everything changed through it is
//    committed when it ends, or when the process exits through exit() while
//    it is open; nothing is when the process dies otherwise (killed,
//    aborted): the next opener finds the host as it was before. Each
//    operation inside it that may change the host is a savepoint, undone
//    whole when it fails: its entry (instrument/call.h) opens it.
//  - A host file that the opening made is reported once on standard error:
//    "created a new default host at PATH".
//  - A forked child does not use its parent's session (Current() is null
//    there) and leaves the parent's lock alone.
#pragma once

#include <memory>
#include <optional>
#include <string>

#include "tarnctl/store/host_file.h"
#include "tarnctl/store/location.h"
#include "tarnctl/store/transaction.h"

namespace TarnCtl::Api {

class Session {
 public:
  // The process's session, opened when none is open.
  static std::shared_ptr<Session> Acquire();
  // The open session, or nullptr.
  static std::shared_ptr<Session> Current();
  // Opens the process's session at `location` with `options`; the open
  // one when it is at `location`. Refuses another location while one is
  // open.
  static std::shared_ptr<Session> AcquireAt(const Store::Location& location,
                                            const Store::OpenOptions& options);
  // A session of its own at `location`, not the process's: Current() and
  // Acquire() do not hand it out, and an exit does not commit it. It
  // commits when it goes, as the process's does, and says nothing of a
  // host it made.
  static std::shared_ptr<Session> Open(const Store::Location& location,
                                       const Store::OpenOptions& options);
  // Where Acquire() would open the host.
  static Store::Location DefaultLocation();

  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  Store::Db& db() { return host_->db(); }
  const std::string& path() const { return host_->path(); }

  // Commits the run so far and goes on in a new transaction. A failed
  // commit throws what it met, and the session commits nothing more.
  void Commit();
  // Commits the run so far, then makes the host the database file `file`
  // (Store::Db::ReplaceWith), and goes on in a new transaction.
  void ReplaceHost(const std::string& file);

 private:
  Session(Store::Location location, std::unique_ptr<Store::HostFile> host);
  // Commits the run for good; a failure is reported on standard error and
  // ends the process with status 1 (the message says whether the change
  // stood). A run that SQLite already ended after a failure is left alone.
  void End() noexcept;

  Store::Location location_;
  std::unique_ptr<Store::HostFile> host_;
  std::optional<Store::Transaction> run_;
  bool traced_ = false;        // the process's session: a run of the JSON trace
  int64_t changesAtOpen_ = 0;  // the connection's changes when it opened
};

}  // namespace TarnCtl::Api
