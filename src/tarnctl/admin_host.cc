// The administration host object: opening, replacing and rebooting the host.
#include <string>
#include <vector>

#include "tarnctl/admin.h"
#include "tarnctl/admin_state.h"
#include "tarnctl/default_host.h"
#include "tarnctl/session.h"

namespace TarnCtl::Admin {

using Detail::Session;
using Detail::Transaction;

Host::Host() : state_(std::make_unique<State>()) {
  state_->session = Session::Acquire();
}

Host::~Host() = default;

void Host::Init(bool empty) {
  Session& session = *state_->session;
  Transaction transaction(session);
  std::vector<std::string> tables;
  {
    Detail::Statement select = session.Prepare(
        "SELECT name FROM sqlite_schema WHERE type = 'table' AND name NOT LIKE 'sqlite_%'");
    while (select.Step()) tables.push_back(select.Text(0));
  }
  for (const std::string& table : tables) {
    const std::string sql = "DELETE FROM \"" + table + "\"";
    session.Exec(sql.c_str());
  }
  session.Exec(empty ? Detail::kEmptyHostSql : Detail::kDefaultHostSql);
  transaction.Commit();
}

void Host::Reboot() {
  Session& session = *state_->session;
  Transaction transaction(session);
  session.Exec(R"sql(
    DELETE FROM vswitch WHERE layer = 1;
    DELETE FROM portgroup WHERE layer = 1;
    DELETE FROM link WHERE layer = 1;
    DELETE FROM dvswitch WHERE layer = 1;
    DELETE FROM dvs_uplink WHERE layer = 1;
    DELETE FROM uplink_timeout WHERE layer = 1;
    DELETE FROM lag_timeout WHERE layer = 1;
    DELETE FROM ens;
    UPDATE meta SET value = '0' WHERE key = 'ens_node';
  )sql");
  transaction.Commit();
}

}  // namespace TarnCtl::Admin
