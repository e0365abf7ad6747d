// Distributed switch commands: creation, DVPort uplinks, the DVPort test
// event, and the MTU of standard and distributed switches.
#include <cstdint>
#include <cstdlib>
#include <ctime>
#include <iostream>
#include <memory>
#include <string>

#include "commands/commands.h"
#include "hostctl/tarnctl.h"
#include "hostctl/uuid_text.h"

namespace Commands {
namespace {

constexpr const char kCswitch[] = "cswitch";
constexpr const char kEtherswitch[] = "etherswitch";
// Versions above this one are DVS 6.6 and later, which only cswitch backs.
constexpr uint32_t kLastEtherswitchVersion = 5;
constexpr int32_t kDefaultCswitchVersion = 6;

// The class and version handed to the library, chosen from what was given.
struct Implementation {
  std::string implClass;
  int32_t version;
};

Implementation ChooseImplementation(const Cli::CommandOptions& options) {
  const bool classGiven = !options.implClass.empty();
  const bool versionGiven = !options.dvsVersion.empty();
  // Taken as a 32-bit signed value whatever strtol read.
  const int32_t number = static_cast<int32_t>(std::strtol(options.dvsVersion.c_str(), nullptr, 10));
  if (classGiven && versionGiven) return {options.implClass, number};
  if (classGiven) {
    return {options.implClass, options.implClass == kCswitch
                                   ? kDefaultCswitchVersion
                                   : static_cast<int32_t>(kLastEtherswitchVersion)};
  }
  if (versionGiven) {
    return {number <= static_cast<int32_t>(kLastEtherswitchVersion) ? kEtherswitch : kCswitch,
            number};
  }
  return {kCswitch, kDefaultCswitchVersion};
}

// Ends the run (a Failure) when the class cannot be backed by the version. The version
// is compared unsigned, so a negative one counts as a late version.
void CheckBacking(const Implementation& impl) {
  const uint32_t version = static_cast<uint32_t>(impl.version);
  if (version > kLastEtherswitchVersion && impl.implClass == kEtherswitch) {
    throw Failure{1, "Implementation class etherswitch cannot be                backed by DVS 6.6"};
  }
  if (version <= kLastEtherswitchVersion && impl.implClass == kCswitch) {
    throw Failure{1, "Implementation class cswitch can be backed                only from DVS 6.6"};
  }
}

// The port named by `dvPortId` on `dvs`, with `param` holding its key.
// Ends the run (a Failure) when the key names no valid port.
std::unique_ptr<TarnCtl::Network::DVPortImpl> OpenDVPort(HostCtl::Network::DVSwitch& dvs,
                                                         const std::string& dvPortId,
                                                         HostCtl::Network::DVPortParam& param) {
  param.switchId = dvs.GetDVSwitchId();
  param.portId = dvPortId;
  param.connectionId = 0;
  auto port = std::make_unique<TarnCtl::Network::DVPortImpl>(param);
  if (!port->IsValid()) {
    throw Failure{1, "Invalid DVPort params " + dvPortId};
  }
  return port;
}

}  // namespace

int CreateDVSwitch(HostCtl::Network::VirtualSwitchInfo& info, const Cli::CommandOptions& options) {
  // UuidToString hands out a shared buffer: keep our own copy of it.
  const std::string uuid =
      options.uuidText.empty()
          ? std::string(HostCtl::Text::UuidToString(options.switchName.c_str()))
          : options.uuidText;
  const Implementation impl = ChooseImplementation(options);
  CheckBacking(impl);
  try {
    info.AddDVSwitch(uuid, options.switchName, impl.implClass, options.switchName, options.numPorts,
                     impl.version, 0);
  } catch (const HostCtl::Lib::HostCtlException& e) {
    std::cerr << "Failed to add DVswitch: " << options.switchName << ", Error: " << e.GetMessage()
              << std::endl;
    return 1;
  }
  return 0;
}

void EditDVPortUplink(HostCtl::Network::DVSwitch& dvs, const Cli::CommandOptions& options,
                      bool add) {
  HostCtl::Network::DVPortParam param;
  auto port = OpenDVPort(dvs, options.dvPortId, param);
  // A port without a connection id gets one before its uplinks change.
  if (port->GetConnectionId() == 0) {
    port->SetConnectionId(static_cast<uint32_t>(std::time(nullptr)));
  }
  param.connectionId = port->GetConnectionId();
  if (add) {
    dvs.AddDVPortUplink(options.uplinkName, param);
  } else {
    dvs.RemoveDVPortUplink(options.uplinkName, 0);
  }
}

void TestDVPortEvent(HostCtl::Network::DVSwitch& dvs, std::string dvPortId) {
  HostCtl::Network::DVPortParam param;
  auto port = OpenDVPort(dvs, dvPortId, param);
  port->TestDVPortNota();
}

void SetSwitchMTU(HostCtl::Network::VirtualSwitch& sw, uint16_t mtu) {
  sw.SetMTU(mtu);
}

void SetSwitchMTU(HostCtl::Network::DVSwitch& dvs, uint16_t mtu) {
  dvs.SetMTU(mtu);
}

}  // namespace Commands
