// The administration of the simulated host: seeding refusals, and the dump
// that must reproduce a host exactly and refuse any faulty document
// without touching the host.
#include <nlohmann/json.hpp>
#include "host_fixture.h"
#include "tarnctl/api/session.h"

namespace {

using namespace TarnCtl::Admin;

class AdminTest : public HostTest {
 protected:
  // A host with something in every table the administration can fill.
  static void Seed(Host& host) {
    AddPnic(host.db(), "pnic4");
    AddPnic(host.db(), "pnic5");
    AddClient(host.db(), "Management", "vm1");
    AddClient(host.db(), "Management", "vm2");
    AddSystemSwitch(host.db(), "sys0", 64);
    AddDVSwitch(host.db(), {"dvs0", "ps0", std::nullopt, 256, 9000, {"pnic1", "pnic2"}});
    AddDVPort(host.db(), {"dvs0", "100", {"vmA", "vmB"}, 42});
    AddDVPort(host.db(), {"dvs0", "101", {}, 0});
    AddOpaqueSwitch(host.db(), {"opq0", std::nullopt, 32, 5, {"pnic3"}});
    AddUplinkTimeout(host.db(), "vswitch0", "pnic0", 7, 255);
    AddLagTimeout(host.db(), "dvs0", 3, 0);
    // Fault texts are free bytes, not necessarily text.
    AddFault(host.db(), {"SetVlanId", "pg2", "boom\xff\"q\"\n", "boom in detail", 1, 2});
    AddFault(host.db(), {"GetName", std::nullopt, std::nullopt, std::nullopt, 0, 1});
  }
};

TEST_F(AdminTest, DumpLoadDumpReproducesTheHost) {
  std::string dumped, shown;
  {
    Host host;
    Seed(host);
    dumped = DumpHost(host.db());
    shown = Show(host.db());
  }
  ASSERT_EQ(dumped.back(), '\n');
  for (const char* part : {"\"hex\":", "\"uplinkOrder\": [\n", "\"target\": null"}) {
    EXPECT_NE(dumped.find(part), std::string::npos) << part;
  }
  // Into an emptied host, and into a brand-new file.
  for (const char* db : {"host.db", "other.db"}) {
    setenv("TARN_HOST_DB", Path(db).c_str(), 1);
    Host host;
    Init(host.db(), true);
    LoadHost(host.db(), dumped);
    EXPECT_EQ(DumpHost(host.db()), dumped) << db;
    // The same host but for its file, which the first line names.
    const std::string again = Show(host.db());
    EXPECT_EQ(again.substr(again.find('\n')), shown.substr(shown.find('\n'))) << db;
  }
}

// What is safe to infer is inferred: tables left out are empty, keys come
// in any order, and counters left out are assigned in file order.
TEST_F(AdminTest, LoadInfersWhatIsSafeToInfer) {
  Host host;
  Seed(host);
  const std::string good = DumpHost(host.db());
  auto document = nlohmann::json::parse(good);  // keys sorted, as `jq -S` writes them
  auto& tables = document["tables"];
  tables.erase("fault");
  for (auto& [name, rows] : tables.items()) {
    for (auto& row : rows) row.erase("seq");
  }
  tables["meta"] = nlohmann::json::array();  // next_seq and ens_node: inferred
  LoadHost(host.db(), document.dump());
  const std::string shown = Show(host.db());
  EXPECT_EQ(shown.substr(0, shown.find("Faults")), [&] {
    Host copy;
    LoadHost(copy.db(), good);
    ClearFaults(copy.db());
    const std::string all = Show(copy.db());
    return all.substr(0, all.find("Faults"));
  }());

  // One seq left out among given ones: it goes after the largest, and the
  // counter after it.
  document = nlohmann::json::parse(good);
  auto& groups = document["tables"]["portgroup"];
  groups[0].erase("seq");
  document["tables"]["meta"] = nlohmann::json::array();
  int64_t largest = 0;
  for (auto& [name, rows] : document["tables"].items()) {
    for (auto& row : rows) largest = std::max<int64_t>(largest, row.value("seq", 0));
  }
  LoadHost(host.db(), document.dump());
  const auto loaded = nlohmann::json::parse(DumpHost(host.db()))["tables"];
  int64_t assigned = 0;
  for (const auto& row : loaded["portgroup"]) {
    if (row["name"] == groups[0]["name"] && row["layer"] == groups[0]["layer"])
      assigned = row["seq"];
  }
  EXPECT_EQ(assigned, largest + 1);
  std::string next;
  for (const auto& row : loaded["meta"]) {
    if (row["key"] == "next_seq") next = row["value"];
  }
  EXPECT_EQ(next, std::to_string(largest + 2));
}

// Each refusal of seeding and removal in its words (the detailed message,
// which tarnhost prints without the operation's name: the tarnhost
// transcript), but those of the rules that the model and API tests show.
TEST_F(AdminTest, SeedingAndRemovalRefuseAndChangeNothing) {
  auto dvs = [](DVSwitchSeed seed) { return [seed](Host& h) { AddDVSwitch(h.db(), seed); }; };
  auto fault = [](FaultSeed seed) { return [seed](Host& h) { AddFault(h.db(), seed); }; };
  auto dvport = [](DVPortSeed seed) { return [seed](Host& h) { AddDVPort(h.db(), seed); }; };
  const std::string tooLong = "0123456789012345678901234567890123";
  const struct {
    std::function<void(Host&)> call;
    std::string detail;
  } cases[] = {
      {[&](Host& h) { AddPnic(h.db(), tooLong); },
       "AddPnic: Pnic name " + tooLong + " is too long (at most 31 bytes)"},
      {[](Host& h) { AddClient(h.db(), "nosuch", "vm1"); },
       "AddClient: Portgroup nosuch does not exist"},
      {[](Host& h) { AddClient(h.db(), "Management", "vm1"); },
       "AddClient: Client vm1 is already on portgroup Management"},
      {[](Host& h) { AddClient(h.db(), "Management", "\x1b[2J"); },
       "AddClient: Client name contains a control character (byte 1)"},
      {dvs({"d", {}, {}, 128, 1500, {"pnic0"}}),
       "AddDVSwitch: pnic0 is already linked to vswitch0"},
      {dvs({"d", {}, {}, 128, 1500, {"pnic4", "pnic4"}}),
       "AddDVSwitch: Uplink pnic4 is given twice"},
      {dvs({"d", {}, {}, 128, 1279, {}}), "AddDVSwitch: MTU 1279 is out of range (1280-9000)"},
      {dvs({tooLong, {}, {}, 128, 1500, {}}),
       "AddDVSwitch: Virtual switch name " + tooLong + " is too long (at most 31 bytes)"},
      {dvs({"d", {}, "dvs-dvs0", 128, 1500, {}}),
       "AddDVSwitch: A DVS with id dvs-dvs0 already exists on this host"},
      {dvport({"nosuch", "10", {}, 0}), "AddDVPort: DVS nosuch does not exist"},
      {dvport({"dvs0", "100", {}, 0}), "AddDVPort: DVPort 100 already exists on dvs0"},
      {dvport({"dvs0", "7", {"a", "a"}, 0}), "AddDVPort: Client a is given twice"},
      {[](Host& h) {
         AddOpaqueSwitch(h.db(), {"o1", {}, 16, 17, {}});
       },
       "AddOpaqueSwitch: Invalid number of used ports 17 (0-16)"},
      {[](Host& h) { AddUplinkTimeout(h.db(), "vs0", "u1", 1, 256); },
       "AddUplinkTimeout: Invalid timeout 256 (0-255)"},
      {[](Host& h) { AddUplinkTimeout(h.db(), "vswitch0", "pnic0", 7, 1); },
       "AddUplinkTimeout: An uplink timeout for vswitch0, pnic0, LAG 7 is already stored"},
      {[](Host& h) { AddLagTimeout(h.db(), "", 3, 1); }, "AddLagTimeout: Portset name is empty"},
      {fault({"", {}, {}, {}, 0, 1}), "AddFault: Fault operation is empty"},
      {fault({"GetName", {}, {}, {}, -1, 1}),
       "AddFault: Invalid skip count -1 (it must be 0 or more)"},
      {fault({"GetName", {}, {}, {}, 0, 0}), "AddFault: Invalid times 0 (it must be 1 or more)"},
      {fault({"GetName", {}, {}, {}, 0, 1, -1}),
       "AddFault: Invalid delay -1 ms (it must be 0 or more)"},
      {fault({"SetVlanID", {}, {}, {}, 0, 1}),
       "AddFault: Unknown operation SetVlanID (did you mean SetVlanId?)"},
      {[](Host& h) { RemovePnic(h.db(), "pnic0"); },
       "RemovePnic: Pnic pnic0 is linked to vswitch0"},
      {[](Host& h) { RemovePnic(h.db(), "pnic9"); }, "RemovePnic: Pnic pnic9 does not exist"},
      {[](Host& h) { RemoveDVSwitch(h.db(), "ps0"); }, "RemoveDVSwitch: DVS ps0 does not exist"},
      {[](Host& h) { RemoveDVPort(h.db(), "d9", "1"); },
       "RemoveDVPort: DVPort 1 does not exist on d9"},
      {[](Host& h) { RemoveOpaqueSwitch(h.db(), "dvs0"); },
       "RemoveOpaqueSwitch: Opaque switch dvs0 does not exist"},
      {[](Host& h) { RemoveClient(h.db(), "pg1", "vm1"); },
       "RemoveClient: Client vm1 is not on portgroup pg1"},
      {[](Host& h) { RemoveUplinkTimeout(h.db(), "vswitch0", "pnic0", 8); },
       "RemoveUplinkTimeout: No uplink timeout for vswitch0, pnic0, LAG 8 is stored"},
      {[](Host& h) { RemoveLagTimeout(h.db(), "vs0", 1); },
       "RemoveLagTimeout: No LAG timeout for vs0, LAG 1 is stored"},
  };
  Host host;
  Seed(host);
  const std::string before = DumpHost(host.db());
  for (const auto& c : cases) {
    EXPECT_EQ(Refused([&] { c.call(host); }).second, c.detail);
    EXPECT_EQ(DumpHost(host.db()), before) << c.detail;
  }
}

// What seeding adds, removal takes away whole: a distributed switch from
// the cache too, with its DVPorts; a fault keeps its number while armed.
TEST_F(AdminTest, RemovalUndoesSeeding) {
  Host host;
  const std::string before = Show(host.db());
  AddPnic(host.db(), "pnic4");
  AddClient(host.db(), "Management", "vm1");
  AddSystemSwitch(host.db(), "sys0", 64);
  AddDVSwitch(host.db(), {"dvs0", "ps0", std::nullopt, 128, 1500, {"pnic1"}});
  AddDVPort(host.db(), {"dvs0", "100", {}, 0});
  AddOpaqueSwitch(host.db(), {"opq0", std::nullopt, 32, 5, {"pnic4"}});
  AddUplinkTimeout(host.db(), "vswitch0", "pnic0", 7, 255);
  AddLagTimeout(host.db(), "ps0", 3, 0);
  AddFault(host.db(), {"SetVlanId", "pg2", {}, {}, 0, 1});
  AddFault(host.db(), {"GetName", {}, "a\tb", {}, 0, 1});
  RemoveFault(host.db(), 1);
  EXPECT_EQ(List(host.db(), Listing::kFaults),
            (std::vector<ListRow>{{"2", "GetName", "", "0", "1", "\"a\\tb\"",
                                   "\"injected fault in GetName\"", "0", "", "", "0", "armed"}}));
  RemoveFault(host.db(), 2);
  RemoveOpaqueSwitch(host.db(), "opq0");
  RemovePnic(host.db(), "pnic4");
  RemoveDVSwitch(host.db(), "dvs0");
  RemoveSystemSwitch(host.db(), "sys0");
  RemoveClient(host.db(), "Management", "vm1");
  RemoveUplinkTimeout(host.db(), "vswitch0", "pnic0", 7);
  RemoveLagTimeout(host.db(), "ps0", 3);
  EXPECT_EQ(Show(host.db()), before);
  EXPECT_TRUE(List(host.db(), Listing::kDVPorts).empty());
}

// The process's own host, one in memory and another file each keep what
// was done to them; the process's host is never handed out for another.
TEST_F(AdminTest, HostsOpenAtOnceStayApart) {
  const std::string otherPath = Path("other.db");
  auto pnics = [](Host& host) {
    std::string names;
    for (const auto& row : List(host.db(), Listing::kPnics)) names += row[0] + " ";
    return names;
  };
  Host mine;
  AddPnic(mine.db(), "pnic4");
  Host memory = Host::Open(TarnCtl::Store::Location::Memory("snapshot"));
  LoadHost(memory.db(), DumpHost(mine.db()));
  AddPnic(memory.db(), "pnic5");
  {
    Host other = Host::Open(TarnCtl::Store::Location::File(otherPath));
    RemovePnic(other.db(), "pnic3");
    EXPECT_EQ(Show(other.db()).substr(0, otherPath.size() + 7), "Host: " + otherPath + "\n");
  }
  Host other = Host::Open(TarnCtl::Store::Location::File(otherPath));
  EXPECT_EQ(pnics(mine), "pnic0 pnic1 pnic2 pnic3 pnic4 ");
  EXPECT_EQ(pnics(memory), "pnic0 pnic1 pnic2 pnic3 pnic4 pnic5 ");
  EXPECT_EQ(pnics(other), "pnic0 pnic1 pnic2 ");
  EXPECT_EQ(memory.Path(), "snapshot");
  EXPECT_EQ(Refusal([&] {
              TarnCtl::Api::Session::AcquireAt(TarnCtl::Store::Location::File(otherPath), {});
            }),
            "Host " + path_ + " is open already");
  EXPECT_EQ(TarnCtl::Api::Session::AcquireAt(TarnCtl::Store::Location::File(path_), {})->path(),
            mine.Path());
}

TEST_F(AdminTest, ASeededSystemSwitchIsInBothLayers) {
  Host host;
  AddSystemSwitch(host.db(), "sys0", 64);
  const std::string dump = DumpHost(host.db());
  size_t at = 0;
  int copies = 0;
  while ((at = dump.find("\"name\": \"sys0\"", at)) != std::string::npos) ++copies, ++at;
  EXPECT_EQ(copies, 2);
  EXPECT_NE(dump.find("\"system\": 1"), std::string::npos);
}

// Load holds a dump to the rules the library applies: every value, and
// every invariant across rows (their wording: the model test; one through
// tarnhost: docs/dump.md). Each faulty dump is refused naming what is wrong,
// and the host stays as it was.
TEST_F(AdminTest, LoadRefusesWhatTheLibraryWouldNeverMake) {
  using Json = nlohmann::ordered_json;
  Host host;
  Seed(host);
  const std::string good = DumpHost(host.db());
  const Json document = Json::parse(good);
  // The pointer to the first row of `table` with that name (meta's: key).
  auto at = [&](const std::string& table, const std::string& name) {
    const Json& rows = document["tables"][table];
    for (size_t i = 0; i < rows.size(); ++i) {
      if (rows[i].value("name", rows[i].value("key", "")) == name) {
        return "/tables/" + table + "/" + std::to_string(i);
      }
    }
    throw std::runtime_error("no row " + name);
  };
  // The dump with `value` put at `pointer`, or what is there removed.
  auto with = [&](const std::string& pointer, const std::optional<Json>& value) {
    Json changed = document;
    const Json::json_pointer where(pointer);
    if (value) {
      changed[where] = *value;
    } else {
      changed[where.parent_pointer()].erase(where.back());
    }
    return changed.dump(2);
  };
  const std::string sys0 = at("vswitch", "sys0"), management = at("portgroup", "Management");
  const std::string nextSeq = at("meta", "next_seq") + "/value";
  int64_t largestSeq = 0;
  for (const auto& [name, rows] : document["tables"].items()) {
    for (const auto& row : rows) largestSeq = std::max<int64_t>(largestSeq, row.value("seq", 0));
  }
  const struct {
    const char* what;
    std::string text;
    const char* message;
  } cases[] = {
      {"trailing text", good + "x", "not valid JSON"},
      {"cut short", good.substr(0, 300),
       "not valid JSON: JSON document ended early in the middle of an object or array."},
      {"array", "[]", "a dump is a JSON object"},
      {"version as text", with("/version", "1"), "must be an integer"},
      {"version 9", with("/version", 9), "unsupported version 9 (this host reads version 1)"},
      {"version missing", with("/version", {}), "key \"version\" is missing"},
      {"format wrong", with("/format", "other"), "\"format\" must be"},
      {"table unknown", with("/tables/faults", Json::array()), "unknown table \"faults\""},
      {"table not an array", with("/tables/ens", Json::object()), "table \"ens\" must be an array"},
      {"field missing", with(management + "/vlan", {}),
       "table \"portgroup\", row 1, field \"vlan\": is missing"},
      {"field unknown", with(at("pnic", "pnic4") + "/colour", 1), "unknown field \"colour\""},
      {"wrong type", with(management + "/vlan", "0"), "must be an integer"},
      {"mtu", with(sys0 + "/mtu", -1500), "MTU -1500 is out of range (1280-9000)"},
      {"name with a newline", with(at("pnic", "pnic5") + "/name", "pnic5\nx"),
       "field \"name\": Pnic name contains a control character (byte 6)"},
      {"policy incomplete", with(sys0 + "/policy/maxActive", {}),
       "field \"policy\": maxActive is missing"},
      {"policy negative", with(sys0 + "/policy/maxActive", -5), "Invalid max active uplinks -5"},
      {"policy out of range", with(sys0 + "/policy/linkCriteria/fullDuplex", 256),
       "field \"policy\": linkCriteria.fullDuplex must be an integer from 0 to 255"},
      {"policy repeats a pnic", with(sys0 + "/policy/uplinkOrder", Json::array({"pnic4", "pnic4"})),
       "Uplink pnic4 appears twice in the teaming order"},
      {"duplicate row", with(at("pnic", "pnic5") + "/name", "pnic4"),
       "repeats the key of an earlier row"},
      {"opaque repeats a pnic",
       with(at("opaque", "opq0") + "/uplinks", Json::array({"pnic4", "pnic4"})),
       "names pnic4 twice"},
      {"opaque overused", with(at("opaque", "opq0") + "/used_ports", 100),
       "Invalid number of used ports 100 (0-32)"},
      {"unknown fault operation", with("/tables/fault/0/operation", "SetVlanID"),
       "Unknown operation SetVlanID"},
      {"counter zero", with(nextSeq, "0"), "\"next_seq\" must be a number from 1 to"},
      {"counter at the end", with(nextSeq, "9223372036854775807"),
       "\"next_seq\" must be a number from 1 to"},
      {"counter at the largest seq", with(nextSeq, std::to_string(largestSeq)),
       "is not beyond the largest seq"},
  };
  for (const auto& c : cases) {
    const std::string message = Refusal([&] { LoadHost(host.db(), c.text); });
    EXPECT_NE(message.find(c.message), std::string::npos) << c.what << ": " << message;
    EXPECT_EQ(DumpHost(host.db()), good) << c.what;
  }
}

}  // namespace
