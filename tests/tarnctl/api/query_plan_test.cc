// Every statement the library prepares in this program's tests scans no
// table that grows with the host, but in the steps that must read whole
// tables; checked when the process ends.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <string>

#include "tarnctl/store/host_file.h"

namespace {

using TarnCtl::Store::Db;

// Tables whose rows grow with the host's switches, port groups, clients,
// DVPorts and history. Not among them: meta (two rows), fault (what a test
// arms) and opaque (each opaque switch is a whole other control plane: a
// host has few).
const std::set<std::string> kGrowing = {"vswitch",      "portgroup",  "link",   "client",
                                        "dvswitch",     "dvs_uplink", "dvport", "dvport_client",
                                        "dvport_event", "ens_event",  "ens",    "uplink_timeout",
                                        "lag_timeout",  "pnic"};
// The steps that read whole tables by their nature: the listings of the
// library and of tarnhost, the dump and load, a reboot (all of the running
// state goes), the restores (all of the stored configuration comes back)
// and the diff of two hosts.
const std::set<std::string> kWholeTable = {"GetVirtualSwitches",
                                           "GetDVSwitches",
                                           "GetOpaqueSwitches",
                                           "GetAllPortGroupNames",
                                           "RestoreVirtualSwitches",
                                           "RestoreDVSwitches",
                                           "Show",
                                           "Dump",
                                           "Diff",
                                           "Load",
                                           "List",
                                           "Reboot"};

std::map<std::string, std::set<std::string>>& Seen() {
  static std::map<std::string, std::set<std::string>> seen;  // SQL -> contexts
  return seen;
}

class QueryPlans : public ::testing::Environment {
 public:
  void SetUp() override {
    Db::Observe([](const std::string& sql, const char* context) {
      Seen()[sql].insert(context != nullptr ? context : "(none)");
    });
  }
  void TearDown() override {
    Db::Observe(nullptr);
    auto host = TarnCtl::Store::HostFile::Open(TarnCtl::Store::Location::Memory(), {});
    for (const auto& [sql, contexts] : Seen()) {
      bool whole = true;
      for (const auto& context : contexts) whole = whole && kWholeTable.count(context);
      if (whole) continue;
      for (const std::string& step : host->db().QueryPlan(sql)) {
        if (step.rfind("SCAN ", 0) != 0) continue;
        const std::string table = step.substr(5, step.find(' ', 5) - 5);
        EXPECT_FALSE(kGrowing.count(table))
            << step << "\n  in: " << sql << "\n  by: " << *contexts.begin();
      }
    }
  }
};

const auto* const kQueryPlans = ::testing::AddGlobalTestEnvironment(new QueryPlans);

}  // namespace
