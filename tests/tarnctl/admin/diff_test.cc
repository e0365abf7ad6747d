// The diff of two hosts, made from dumps edited as a user would edit them,
// and snapshots kept beside the host and brought back whole.
#include <nlohmann/json.hpp>

#include "host_fixture.h"
#include "tarnctl/admin/diff.h"
#include "tarnctl/admin/snapshots.h"

namespace {

using namespace TarnCtl::Admin;
using Json = nlohmann::ordered_json;
using TarnCtl::Store::Location;

class DiffTest : public HostTest {
 protected:
  // The default host with a DVPort, a fault and an event.
  std::string BaseDump() {
    Host host;
    AddDVSwitch(host.db(), {"dvs0", std::nullopt, std::nullopt, 128, 1500, {"pnic1"}});
    AddDVPort(host.db(), {"dvs0", "100", {"vm1"}, 42});
    AddFault(host.db(), {"SetVlanId", std::nullopt, std::nullopt, std::nullopt, 0, 2});
    return DumpHost(host.db());
  }
  static Host Loaded(const std::string& dump) {
    Host host = Host::Open(Location::Memory("dump"));
    LoadHost(host.db(), dump);
    return host;
  }
  // Each row of `table` named `name`, in the layers given (none: all).
  static void Edit(Json& dump, const char* table, const std::string& name,
                   std::initializer_list<int> layers, const std::function<void(Json&)>& edit) {
    for (Json& row : dump["tables"][table]) {
      const bool inLayer = !row.contains("layer") ||
                           std::find(layers.begin(), layers.end(), row["layer"]) != layers.end();
      if (row.value("name", row.value("port_id", "")) == name && inLayer) edit(row);
    }
  }
};

TEST_F(DiffTest, EachChangeIsOneLinePerFieldNamingItsObjectAndLayers) {
  const std::string base = BaseDump();
  auto newRow = [](Json& dump, const char* table, Json row) {
    dump["tables"][table].push_back(std::move(row));
  };
  const struct {
    const char* what;
    std::function<void(Json&)> change;
    const char* lines;
  } cases[] = {
      {"nothing", [](Json&) {}, ""},
      {"a field in one layer",
       [](Json& d) { Edit(d, "portgroup", "Management", {1}, [](Json& r) { r["vlan"] = 42; }); },
       "portgroup Management [running]: vlan 0 -> 42\n"},
      {"the same in both layers",
       [](Json& d) {
         Edit(d, "portgroup", "Management", {0, 1}, [](Json& r) { r["vlan"] = 42; });
       },
       "portgroup Management [running, stored]: vlan 0 -> 42\n"},
      {"a failover order, as a list",
       [](Json& d) {
         Edit(d, "vswitch", "vswitch0", {0}, [](Json& r) {
           r["policy"]["uplinkOrder"] = {"pnic2", "pnic0"};
         });
       },
       "vswitch vswitch0 [stored]: teaming.uplinkOrder pnic0 -> pnic2,pnic0\n"},
      {"objects that came, in creation order, and one that went",
       [&](Json& d) {
         d["tables"]["pnic"].erase(3);
         newRow(d, "pnic", {{"name", "zz"}});
         newRow(d, "pnic", {{"name", "aa"}});
         Json group = d["tables"]["portgroup"][1];
         group["name"] = "Storage";
         group.erase("seq");
         newRow(d, "portgroup", group);
       },
       "- pnic pnic3\n+ pnic zz\n+ pnic aa\n+ portgroup Storage on vswitch0 [running]\n"},
      {"not layered: a DVPort, a fault that fired, an event",
       [&](Json& d) {
         d["tables"]["dvport"][0]["connection_id"] = 7;
         d["tables"]["fault"][0]["times"] = 1;
         newRow(d, "dvport_event", {{"dvs", "dvs0"}, {"port_id", "100"}, {"kind", "nota"}});
       },
       "dvport dvs0:100: connectionId 42 -> 7\n+ event DVPort dvs0 port 100: nota\nfault 1 "
       "SetVlanId: times 2 "
       "-> 1\n"},
      {"only the creation counter: the same host",
       [](Json& d) {
         Edit(d, "pnic", "pnic0", {}, [](Json& r) { r["seq"] = 1000; });
         d["tables"]["meta"][1]["value"] = "1001";
       },
       ""},
  };
  Host from = Loaded(base);
  for (const auto& c : cases) {
    Json edited = Json::parse(base);
    c.change(edited);
    Host to = Loaded(edited.dump());
    EXPECT_EQ(DiffText(DiffHosts(from.db(), to.db())), c.lines) << c.what;
  }
}

TEST_F(DiffTest, RecordsCarryTheValuesAndTheLayersSeparately) {
  const std::string base = BaseDump();
  Json edited = Json::parse(base);
  Edit(edited, "portgroup", "Management", {0, 1}, [](Json& r) { r["vlan"] = 5; });
  Host from = Loaded(base), to = Loaded(edited.dump());
  const Json records = DiffJson(DiffHosts(from.db(), to.db()));
  EXPECT_EQ(records.dump(),
            R"([{"kind":"portgroup","name":"Management","layer":"running","field":"vlan",)"
            R"("from":0,"to":5},{"kind":"portgroup","name":"Management","layer":"stored",)"
            R"("field":"vlan","from":0,"to":5}])");
  // A reboot loses the running state, and a restore brings it back.
  TarnCtl::Admin::Reboot(to.db());
  EXPECT_EQ(DiffText(DiffLayers(to.db())),
            "+ vswitch vswitch0\n+ portgroup Management on vswitch0\n+ dvswitch dvs0\n");
}

TEST_F(DiffTest, SnapshotsComeBackWholeAndAreNamedWithCare) {
  std::string saved;
  {
    Host host;
    AddFault(host.db(), {"AddUplink", std::nullopt, std::nullopt, std::nullopt, 0, 1});
    saved = DumpHost(host.db());
    // A copy of the file would miss what the open transaction changed.
    EXPECT_EQ(Refusal([&] { SaveSnapshot(host.db(), path_, "base"); }),
              "Host database " + path_ + ": cannot copy it with changes not committed yet");
    host.Commit();
    SaveSnapshot(host.db(), path_, "base");
    SaveSnapshot(host.db(), path_, "base");  // replaces it
    Init(host.db(), true);
    host.Commit();
    EXPECT_EQ(Snapshots(path_), std::vector<std::string>{"base"});
    auto snapshot = OpenSnapshot(path_, "base");
    EXPECT_EQ(DumpHost(*snapshot), saved);
  }
  {
    Host host;
    RestoreSnapshot(host, "base");
    EXPECT_EQ(DumpHost(host.db()), saved);
    EXPECT_EQ(Refusal([&] { RestoreSnapshot(host, "nope"); }), "No snapshot named nope");
    RemoveSnapshot(path_, "base");
    EXPECT_TRUE(Snapshots(path_).empty());
  }
  for (const auto& [name, problem] : std::vector<std::pair<std::string, std::string>>{
           {"", "is empty"},
           {"a/b", "contains '/'"},
           {".new", "starts with '.'"},
           {"a\tb", "contains a control character"},
           {std::string(65, 'x'), "is longer than 64 bytes"},
           {std::string(64, 'x'), ""}}) {
    EXPECT_EQ(SnapshotNameProblem(name), problem) << name;
  }
}

}  // namespace
