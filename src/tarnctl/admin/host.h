// Administration of the simulated host: what the tool cannot do itself.
// Used by tarnhost. Administration is free functions over a host's
// database (a home per kind of object: pnic.h, standard.h, distributed.h,
// dvport.h, opaque.h, timeouts.h, faults.h, ens.h; the whole host:
// whole_host.h; lists and names: listing.h); each applies the same rules
// the library applies and is undone whole when refused. Refusals throw
// HostCtl::Lib::HostCtlException with a message that says what and why.
//
// A Host is an open host: the process's session (and with it the host's
// lock and the run's transaction), or a host of its own beside it.
#pragma once

#include <memory>
#include <string>

#include "hostctl/exception.h"
#include "tarnctl/store/host_file.h"
#include "tarnctl/store/location.h"

namespace TarnCtl::Api {
class Session;
}

namespace TarnCtl::Admin {

// A failure as people read it: a refusal's explanation, that is its
// detailed message without the operation's name in front ("Invalid number
// of ports 4097 (8-4096)"); a database failure's message; another's
// detailed message, or its message when it has none.
std::string Reason(const HostCtl::Lib::HostCtlException& failure);

// The host file that Host() opens, as the environment names it; refuses a
// mistaken name (TARN_HOST_DB starting with "~").
std::string HostPath();
// The log beside the host file at `path` when a commit waits there to be
// copied into the file; empty when none does.
std::string WaitingLog(const std::string& path);

class Host {
 public:
  // The process's session (opening it, and creating the default host when
  // the file is missing, unless it is open already).
  Host();
  // A host of its own at `location`, beside the process's session: another
  // host file (a snapshot), or a private host in memory. It holds that
  // file's lock, and commits when it goes; it is not committed at exit.
  static Host Open(const Store::Location& location, const Store::OpenOptions& options = {});
  ~Host();
  Host(Host&&) noexcept;
  Host& operator=(Host&&) noexcept;

  Store::Db& db();
  // The host file as the user named it (a private host: its label).
  const std::string& Path() const;
  // Makes what was done so far durable; throws when it cannot.
  void Commit();
  // Commits, and makes the host the host file `file` (a snapshot).
  void ReplaceWith(const std::string& file);

 private:
  explicit Host(std::shared_ptr<Api::Session> session);
  std::shared_ptr<Api::Session> session_;
};

}  // namespace TarnCtl::Admin
