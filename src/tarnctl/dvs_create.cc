// Creation of distributed switches: in the running state and in the cache.
#include <cstdio>

#include "hostctl/tarnctl.h"
#include "tarnctl/call.h"
#include "tarnctl/checks.h"
#include "tarnctl/errors.h"
#include "tarnctl/info_state.h"
#include "tarnctl/limits.h"
#include "tarnctl/names.h"
#include "tarnctl/switches.h"

namespace TarnCtl::Network {

using Detail::Call;
using Detail::FormatArgs;
using Detail::Refused;
using Detail::Session;
using Detail::Transaction;

namespace {

// Sixteen hexadecimal bytes: eight, a '-', eight, separated by spaces.
bool IsUuidText(const std::string& text) {
  unsigned char b[16];
  int consumed = -1;
  const int values = std::sscanf(text.c_str(),
                                 "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx-"
                                 "%02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx %02hhx%n",
                                 &b[0], &b[1], &b[2], &b[3], &b[4], &b[5], &b[6], &b[7], &b[8],
                                 &b[9], &b[10], &b[11], &b[12], &b[13], &b[14], &b[15], &consumed);
  return values == 16 && consumed == static_cast<int>(text.size());
}

}  // namespace

std::unique_ptr<HostCtl::Network::DVSwitch> VirtualSwitchInfoImpl::AddDVSwitch(
    const std::string& uuid, const std::string& switchName, const std::string& implClass,
    const std::string& portsetName, int32_t numPorts, int32_t version, int reserved) {
  Session& session = *state_->session;
  Call call(&session, "AddDVSwitch", Detail::Named(switchName),
            FormatArgs(uuid, switchName, implClass, portsetName, numPorts, version, reserved));
  if (!IsUuidText(uuid)) {
    throw Refused("Invalid UUID " + uuid,
                  "(expected xx xx xx xx xx xx xx xx-xx xx xx xx xx xx xx xx in hexadecimal)");
  }
  if (implClass != "cswitch" && implClass != "etherswitch") {
    throw Refused("Unknown implementation class " + implClass, "(cswitch or etherswitch)");
  }
  if (version < 0) throw Refused("Invalid DVS version " + std::to_string(version));
  Detail::CheckNewSwitchName(session, switchName);
  if (portsetName != switchName) Detail::CheckNewSwitchName(session, portsetName);
  Detail::CheckPorts(numPorts);
  if (session.Prepare("SELECT 1 FROM dvswitch WHERE layer = 1 AND switch_id = ?")
          .Bind(1, uuid)
          .Step()) {
    throw Refused("A DVS with id " + uuid + " already exists", "on this host");
  }

  Transaction transaction(session);
  // Cache entries that the new switch takes the place of go.
  session
      .Prepare(
          "DELETE FROM dvs_uplink WHERE layer = 0 AND dvs IN (SELECT name FROM dvswitch"
          " WHERE layer = 0 AND (name IN (?1, ?2) OR portset IN (?1, ?2) OR switch_id = ?3))")
      .Bind(1, switchName)
      .Bind(2, portsetName)
      .Bind(3, uuid)
      .Run();
  session
      .Prepare(
          "DELETE FROM dvswitch WHERE layer = 0"
          " AND (name IN (?1, ?2) OR portset IN (?1, ?2) OR switch_id = ?3)")
      .Bind(1, switchName)
      .Bind(2, portsetName)
      .Bind(3, uuid)
      .Run();
  const int64_t seq = session.NextSeq();
  for (int64_t layer : {0, 1}) {
    session
        .Prepare(
            "INSERT INTO dvswitch(layer, name, portset, switch_id, uuid, impl_class, version,"
            " num_ports, mtu, seq) VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?)")
        .Bind(1, layer)
        .Bind(2, switchName)
        .Bind(3, portsetName)
        .Bind(4, uuid)
        .Bind(5, uuid)
        .Bind(6, implClass)
        .Bind(7, version)
        .Bind(8, numPorts)
        .Bind(9, Detail::kDefaultMtu)
        .Bind(10, seq)
        .Run();
  }
  transaction.Commit();
  return Detail::FindDVSwitch(state_->session, switchName);
}

}  // namespace TarnCtl::Network
