// A fresh host database per test: TARN_HOST_DB points into a temporary
// directory of the test's own, and tracing is off unless a test turns it on.
#pragma once

#include <stdlib.h>

#include <fstream>
#include <string>
#include <vector>

#include "hostctl/nodi.h"
#include "hostctl/tarnctl.h"
#include "scratch.h"
#include "tarnctl/admin/distributed.h"
#include "tarnctl/admin/dvport.h"
#include "tarnctl/admin/faults.h"
#include "tarnctl/admin/host.h"
#include "tarnctl/admin/listing.h"
#include "tarnctl/admin/opaque.h"
#include "tarnctl/admin/pnic.h"
#include "tarnctl/admin/standard.h"
#include "tarnctl/admin/timeouts.h"
#include "tarnctl/admin/whole_host.h"

namespace HN = HostCtl::Network;
using HN::NetworkFactory;
using TarnCtl::Network::DVPortImpl;
using TarnCtl::Network::NetworkInfoImpl;
using TarnCtl::Network::PortGroupImpl;

class HostTest : public ScratchTest {
 protected:
  void SetUp() override {
    ScratchTest::SetUp();
    path_ = Path("host.db");
    for (const char* name : {"TARN_TRACE", "TARN_TRACE_FORMAT", "TARN_LOCK_TIMEOUT"}) {
      unsetenv(name);
    }
    setenv("TARN_HOST_DB", path_.c_str(), 1);
  }

  void TearDown() override {
    for (const char* name :
         {"TARN_HOST_DB", "TARN_TRACE", "TARN_TRACE_FORMAT", "TARN_LOCK_TIMEOUT"}) {
      unsetenv(name);
    }
    ScratchTest::TearDown();
  }

  // Turns the trace on into a file of the test's directory.
  void StartTrace() { setenv("TARN_TRACE", TracePath().c_str(), 1); }
  std::string TracePath() const { return Path("trace"); }
  std::vector<std::string> TraceLines() const {
    std::ifstream in(TracePath());
    std::vector<std::string> lines;
    for (std::string line; std::getline(in, line);) lines.push_back(line);
    return lines;
  }

  static std::unique_ptr<HN::VirtualSwitch> Switch(const std::string& name) {
    return NetworkFactory::GetVirtualSwitchById(name, HN::PORTSET_GET_DEFAULT);
  }
  static std::unique_ptr<HN::DVSwitch> Dvs(const std::string& name) {
    return NetworkFactory::GetDVSwitchByName(name);
  }
  static void Reboot() { TarnCtl::Admin::Reboot(TarnCtl::Admin::Host().db()); }
  static void Arm(const TarnCtl::Admin::FaultSeed& seed) {
    TarnCtl::Admin::AddFault(TarnCtl::Admin::Host().db(), seed);
  }

  // The default host (vswitch0 on pnic0, port group Management) plus vs1
  // (64 ports) on pnic1 with pg1 (clients vm-a, vm-b) and pg2; dvs0 (portset
  // dvs0-ps, id dvs-dvs0) on pnic2 with DVPorts 100 (client vm-c, connection
  // id 5) and 101; the opaque switch op0 (portset op0-ps) on pnic3; pnic4.
  static void SeedSampleHost() {
    TarnCtl::Admin::Host host;
    TarnCtl::Store::Db& db = host.db();
    TarnCtl::Admin::AddPnic(db, "pnic4");
    TarnCtl::Network::VirtualSwitchInfoImpl info;
    auto vs1 = info.AddVirtualSwitch(
        HN::NicTeamingPolicy::GetDefaultPolicy(), HN::PortSecurityPolicy::GetDefaultPolicy(),
        HN::ShapingPolicy::GetDefaultPolicy(), HN::NicCapabilities::GetDefaultPolicy(), "vs1", 64);
    vs1->AddUplink("pnic1", true);
    vs1->AddPortGroup("pg1");
    vs1->AddPortGroup("pg2");
    TarnCtl::Admin::AddClient(db, "pg1", "vm-a");
    TarnCtl::Admin::AddClient(db, "pg1", "vm-b");
    TarnCtl::Admin::AddDVSwitch(db, {"dvs0", "dvs0-ps", "dvs-dvs0", 128, 1500, {"pnic2"}});
    TarnCtl::Admin::AddDVPort(db, {"dvs0", "100", {"vm-c"}, 5});
    TarnCtl::Admin::AddDVPort(db, {"dvs0", "101", {}, 0});
    TarnCtl::Admin::AddOpaqueSwitch(db, {"op0", "op0-ps", 128, 0, {"pnic3"}});
  }

  std::string path_;
};
