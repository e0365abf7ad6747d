// Opening a host, committing it, and how tarnhost reads a failure.
#include "tarnctl/admin/host.h"

#include "tarnctl/api/session.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Admin {

std::string Reason(const HostCtl::Lib::HostCtlException& failure) {
  if (const auto* refusal = dynamic_cast<const Instrument::Refusal*>(&failure)) {
    return refusal->explanation();
  }
  // A database's failure names the file in its message; the operation that
  // ran adds nothing for people.
  if (dynamic_cast<const Store::DbError*>(&failure) != nullptr) return failure.GetMessage();
  const std::string detail = failure.GetDetailedMessage();
  return detail.empty() ? failure.GetMessage() : detail;
}

std::string HostPath() {
  return Api::Session::DefaultLocation().path;
}

std::string WaitingLog(const std::string& path) {
  return Store::WaitingLog(path);
}

Host::Host() : session_(Api::Session::Acquire()) {}

Host::Host(std::shared_ptr<Api::Session> session) : session_(std::move(session)) {}

Host Host::Open(const Store::Location& location, const Store::OpenOptions& options) {
  return Host(Api::Session::Open(location, options));
}

Host::~Host() = default;
Host::Host(Host&&) noexcept = default;
Host& Host::operator=(Host&&) noexcept = default;

Store::Db& Host::db() {
  return session_->db();
}

const std::string& Host::Path() const {
  return session_->path();
}

void Host::Commit() {
  session_->Commit();
}

void Host::ReplaceWith(const std::string& file) {
  session_->ReplaceHost(file);
}

}  // namespace TarnCtl::Admin
