#include "tarnctl/api/session.h"

#include <pthread.h>
#include <unistd.h>

#include <cstdio>
#include <cstdlib>

#include "tarnctl/instrument/trace.h"

namespace TarnCtl::Api {

using HostCtl::Lib::HostCtlException;

namespace {

struct Process {
  std::weak_ptr<Session> session;
  pid_t owner = 0;  // a forked child must not use its parent's session
};

Process& This() {
  static Process process;
  return process;
}

}  // namespace

Session::Session(Store::Location location, std::unique_ptr<Store::HostFile> host)
    : location_(std::move(location)), host_(std::move(host)) {
  run_.emplace(host_->db());
}

Session::~Session() {
  End();
}

void Session::End() noexcept {
  if (!run_) return;
  if (!host_->db().InTransaction()) {
    // SQLite ended the run after a failure, which its operation reported:
    // nothing is left to commit, or to say.
    run_.reset();
    if (traced_) Instrument::TraceRunEnded(false, false);
    return;
  }
  try {
    run_->Commit();
    run_.reset();
    if (traced_) Instrument::TraceRunEnded(true, host_->db().ChangeCount() != changesAtOpen_);
  } catch (const HostCtlException& e) {
    std::fprintf(stderr, "%s\n", e.GetDetailedMessage().c_str());
    std::fflush(stderr);
    if (traced_) {
      Instrument::TraceRunEnded(host_->db().CommitWaitsInLog(), true);
      Instrument::TraceRunExit(1);
    }
    _exit(1);
  }
}

void Session::Commit() {
  try {
    run_->Commit();
  } catch (const HostCtlException&) {
    if (traced_) Instrument::TraceRunEnded(host_->db().CommitWaitsInLog(), true);
    run_.reset();  // undoes what a failed commit left open; the caller reports the failure
    throw;
  }
  if (traced_) Instrument::TraceRunEnded(true, host_->db().ChangeCount() != changesAtOpen_);
  run_.reset();
  run_.emplace(host_->db());
}

void Session::ReplaceHost(const std::string& file) {
  Commit();
  // The copy commits by itself, outside the run.
  run_.reset();
  try {
    host_->db().ReplaceWith(file);
  } catch (...) {
    run_.emplace(host_->db());
    throw;
  }
  run_.emplace(host_->db());
}

Store::Location Session::DefaultLocation() {
  return Store::ResolveLocation(Store::ProcessEnvironment());
}

std::shared_ptr<Session> Session::Current() {
  Process& process = This();
  if (process.owner != getpid()) return nullptr;
  return process.session.lock();
}

std::shared_ptr<Session> Session::Acquire() {
  if (auto current = Current()) return current;
  return AcquireAt(DefaultLocation(),
                   {Store::LockTimeoutFrom(std::getenv("TARN_LOCK_TIMEOUT")), true});
}

std::shared_ptr<Session> Session::Open(const Store::Location& location,
                                       const Store::OpenOptions& options) {
  return std::shared_ptr<Session>(new Session(location, Store::HostFile::Open(location, options)));
}

std::shared_ptr<Session> Session::AcquireAt(const Store::Location& location,
                                            const Store::OpenOptions& options) {
  if (auto current = Current()) {
    const Store::Location& open = current->location_;
    if (open.kind == location.kind && open.path == location.path) return current;
    throw HostCtlException("Host " + open.path + " is open already",
                           "Host " + open.path + " is open already: " + location.path +
                               " cannot be this process's host as well");
  }
  Process& process = This();
  if (process.owner != 0 && process.owner != getpid()) {
    // A forked child's copy of its parent's session stays untouched: its
    // connection and lock belong to the parent.
    new std::weak_ptr<Session>(std::move(process.session));
    process.session.reset();
  }
  Instrument::ConfigureTrace(std::getenv("TARN_TRACE"), std::getenv("TARN_TRACE_FORMAT"));
  auto host = Store::HostFile::Open(location, options);
  if (host->created()) {
    std::fprintf(stderr, "created a new default host at %s\n", host->path().c_str());
    std::fflush(stderr);
  }
  std::shared_ptr<Session> session(new Session(location, std::move(host)));
  process.session = session;
  process.owner = getpid();
  static const bool registered = [] {
    // A run that ends through exit() keeps what it changed.
    std::atexit([] {
      if (auto open = Current()) open->End();
    });
    // A forked child lets go of its copy of the lock descriptor, so that the
    // parent's release is a release (flock locks belong to the descriptor).
    pthread_atfork(nullptr, nullptr, [] {
      if (auto parent = This().session.lock()) parent->host_->ForgetLockInChild();
    });
    return true;
  }();
  (void)registered;
  // The process's session is its run in the JSON trace.
  session->traced_ = true;
  session->changesAtOpen_ = session->db().ChangeCount();
  Instrument::TraceRunOpened(session->path());
  return session;
}

}  // namespace TarnCtl::Api
