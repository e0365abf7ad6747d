// Arming and clearing injected failures. The library fires them: each call
// of the named operation that matches a row lets `skip` calls pass, then
// fails `times` calls with the row's message and detailed message.
#include <string>

#include "hostctl/exception.h"
#include "tarnctl/admin.h"
#include "tarnctl/admin_state.h"

namespace TarnCtl::Admin {

void Host::AddFault(const FaultSeed& seed) {
  auto refuse = [](const std::string& message) {
    throw HostCtl::Lib::HostCtlException(message, "AddFault: " + message);
  };
  if (seed.operation.empty()) refuse("Fault operation is empty");
  if (seed.skip < 0) refuse("Invalid skip count " + std::to_string(seed.skip) + ": must be >= 0");
  if (seed.times < 1) refuse("Invalid times " + std::to_string(seed.times) + ": must be >= 1");

  Detail::Session& s = *state_->session;
  Detail::Transaction tx(s);
  auto insert = s.Prepare(
      "INSERT INTO fault(operation, target, message, detail, skip, times)"
      " VALUES(?1, ?2, ?3, ?4, ?5, ?6)");
  insert.Bind(1, seed.operation);
  if (seed.on) {
    insert.Bind(2, *seed.on);
  } else {
    insert.BindNull(2);
  }
  insert.Bind(3, seed.message.value_or("injected fault"))
      .Bind(4, seed.detail.value_or("injected fault in " + seed.operation))
      .Bind(5, seed.skip)
      .Bind(6, seed.times)
      .Run();
  tx.Commit();
}

void Host::ClearFaults() {
  Detail::Session& s = *state_->session;
  Detail::Transaction tx(s);
  s.Exec("DELETE FROM fault");
  tx.Commit();
}

}  // namespace TarnCtl::Admin
