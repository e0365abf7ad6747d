// The administration of the simulated host: seeding refusals, and the dump
// that must reproduce a host exactly and refuse any faulty document
// without touching the host.
#include <gtest/gtest.h>
#include <stdlib.h>

#include <functional>
#include <string>

#include "host_fixture.h"
#include "hostctl/exception.h"
#include "tarnctl/admin.h"

namespace {

using TarnCtl::Admin::Host;

class AdminTest : public HostTest {
 protected:
  void UseDatabase(const std::string& name) {
    setenv("TARN_HOST_DB", (dir_ + "/" + name).c_str(), 1);
  }

  // A host with something in every table the administration can fill.
  static void Seed(Host& host) {
    host.AddPnic("pnic4");
    host.AddPnic("pnic5");
    host.AddPnic("nic\xff\"q\"\n");  // names are bytes, not necessarily text
    host.AddClient("Management", "vm1");
    host.AddClient("Management", "vm2");
    host.AddSystemSwitch("sys0", 64);
    host.AddDVSwitch({"dvs0", "ps0", std::nullopt, 256, 9000, {"pnic1", "pnic2"}});
    host.AddDVPort({"dvs0", "100", {"vmA", "vmB"}, 42});
    host.AddDVPort({"dvs0", "101", {}, 0});
    host.AddOpaqueSwitch({"opq0", std::nullopt, 32, 5, {"pnic3"}});
    host.AddUplinkTimeout("vswitch0", "pnic0", 7, 255);
    host.AddLagTimeout("dvs0", 3, 0);
    host.AddFault({"SetVlanId", "pg2", "boom", "boom in detail", 1, 2});
    host.AddFault({"GetName", std::nullopt, std::nullopt, std::nullopt, 0, 1});
  }
};

TEST_F(AdminTest, DumpLoadDumpReproducesTheHost) {
  std::string dumped, shown;
  {
    Host host;
    Seed(host);
    dumped = host.Dump();
    shown = host.Show();
  }
  ASSERT_EQ(dumped.back(), '\n');
  for (const char* part : {"\"hex\":", "\"uplinkOrder\": [\n", "\"target\": null"}) {
    EXPECT_NE(dumped.find(part), std::string::npos) << part;
  }
  // Into an emptied host, and into a brand-new file.
  for (const char* db : {"host.db", "other.db"}) {
    UseDatabase(db);
    Host host;
    host.Init(true);
    host.Load(dumped);
    EXPECT_EQ(host.Dump(), dumped) << db;
    EXPECT_EQ(host.Show(), shown) << db;
  }
}

// The refusals the tarnhost transcript does not already show.
TEST_F(AdminTest, SeedingRefusesAndChangesNothing) {
  const std::string tooLong(32, 'x');
  auto dvs = [](TarnCtl::Admin::DVSwitchSeed seed) {
    return [seed](Host& h) { h.AddDVSwitch(seed); };
  };
  const struct {
    const char* what;
    std::function<void(Host&)> call;
    const char* message;
  } cases[] = {
      {"pnic empty", [](Host& h) { h.AddPnic(""); }, "Pnic name is empty"},
      {"pnic long", [&](Host& h) { h.AddPnic(tooLong); }, "is too long"},
      {"client twice", [](Host& h) { h.AddClient("Management", "vm1"); },
       "Client vm1 is already on portgroup Management"},
      {"client unnamed", [](Host& h) { h.AddClient("Management", ""); }, "Client name is empty"},
      {"name of a portset", [](Host& h) { h.AddSystemSwitch("ps0", 64); }, "ps0 already exists"},
      {"ports low", [](Host& h) { h.AddSystemSwitch("s", 7); }, "Invalid number of ports 7"},
      {"system switch long name", [&](Host& h) { h.AddSystemSwitch(tooLong, 64); }, "is too long"},
      {"pnic of a dvs", dvs({"d", {}, {}, 128, 1500, {"pnic1"}}),
       "pnic1 is already linked to dvs0"},
      {"pnic of opaque", dvs({"d", {}, {}, 128, 1500, {"pnic3"}}),
       "pnic3 is already linked to opq0"},
      {"pnic twice", dvs({"d", {}, {}, 128, 1500, {"pnic4", "pnic4"}}),
       "Uplink pnic4 is given twice"},
      {"dvs mtu", dvs({"d", {}, {}, 128, 9001, {}}), "MTU 9001 is out of range"},
      {"dvs id taken", dvs({"d", {}, "dvs-dvs0", 128, 1500, {}}),
       "Switch id dvs-dvs0 is already in use"},
      {"dvs name taken", dvs({"dvs0", "p9", {}, 128, 1500, {}}), "dvs0 already exists"},
      {"dvport twice",
       [](Host& h) {
         h.AddDVPort({"dvs0", "100", {}, 0});
       },
       "DVPort 100 already exists on dvs0"},
      {"dvport client twice",
       [](Host& h) {
         h.AddDVPort({"dvs0", "7", {"a", "a"}, 0});
       },
       "Client a is given twice"},
      {"uplink timeout twice", [](Host& h) { h.AddUplinkTimeout("vswitch0", "pnic0", 7, 1); },
       "already stored"},
      {"lag timeout twice", [](Host& h) { h.AddLagTimeout("dvs0", 3, 1); }, "already stored"},
      {"lag timeout unnamed portset", [](Host& h) { h.AddLagTimeout("", 3, 1); },
       "Portset name is empty"},
      {"fault negative skip",
       [](Host& h) {
         h.AddFault({"GetName", {}, {}, {}, -1, 1});
       },
       "Invalid skip count -1"},
  };
  Host host;
  Seed(host);
  const std::string before = host.Dump();
  for (const auto& c : cases) {
    const auto [message, detail] = Refused([&] { c.call(host); });
    EXPECT_NE(message.find(c.message), std::string::npos) << c.what << ": " << message;
    EXPECT_EQ(detail.rfind("Add", 0), 0u) << c.what;
    EXPECT_EQ(host.Dump(), before) << c.what;
  }
}

TEST_F(AdminTest, SeededSwitchesFollowTheirDefaults) {
  Host host;
  host.AddDVSwitch({"dvs0", {}, {}, 128, 1500, {}});
  host.AddDVSwitch({"x", "dvs-dvs0", {}, 128, 1500, {}});
  host.AddSystemSwitch("sys0", 64);
  const std::string dump = host.Dump();
  // An id derived from the name (never the portset) stays unique.
  EXPECT_NE(dump.find("\"switch_id\": \"dvs-dvs0\""), std::string::npos);
  EXPECT_NE(dump.find("\"switch_id\": \"dvs-x\""), std::string::npos);
  // Both layers hold the system switch.
  size_t at = 0;
  int copies = 0;
  while ((at = dump.find("\"name\": \"sys0\"", at)) != std::string::npos) ++copies, ++at;
  EXPECT_EQ(copies, 2);
  EXPECT_NE(dump.find("\"system\": 1"), std::string::npos);
}

TEST_F(AdminTest, LoadRefusesFaultyDumpsAndKeepsTheHost) {
  Host host;
  Seed(host);
  const std::string good = host.Dump();
  // The first (or with `last` the last) occurrence of `from` replaced.
  auto replaced = [&](const std::string& from, const std::string& to, bool last = false) {
    auto at = last ? good.rfind(from) : good.find(from);
    EXPECT_NE(at, std::string::npos) << from;
    std::string text = good;
    return at == std::string::npos ? text : text.replace(at, from.size(), to);
  };
  auto counterAt = [&](const std::string& value) {
    const std::string key = "\"key\": \"next_seq\",\n        \"value\": \"";
    const auto at = good.find(key) + key.size();
    std::string text = good;
    return text.replace(at, good.find('"', at) - at, value);
  };
  const struct {
    const char* what;
    std::string text;
    const char* message;
  } cases[] = {
      {"trailing text", good + "x", "not valid JSON"},
      {"array", "[]", "a dump is a JSON object"},
      {"version as text", replaced("\"version\": 1", "\"version\": \"1\""), "must be an integer"},
      {"version missing", replaced("\"version\": 1,", ""), "\"version\" must come before"},
      {"format wrong", replaced("tarnhost-dump", "other"), "\"format\" must be"},
      {"unknown top key", replaced("\"version\": 1,", "\"version\": 1, \"extra\": 0,"),
       "unknown key \"extra\""},
      {"table unknown", replaced("\"fault\": [", "\"faults\": ["), "unknown table \"faults\""},
      {"table missing", replaced("\"ens\": [],", ""), "table \"ens\" is missing"},
      {"table not an array", replaced("\"ens\": []", "\"ens\": {}"), "must be an array"},
      {"field missing", replaced("\"vlan\": 0,", ""), "field \"vlan\" is missing"},
      {"field unknown", replaced("\"vlan\": 0,", "\"vlan\": 0, \"colour\": 1,"),
       "unknown field \"colour\""},
      {"wrong type", replaced("\"vlan\": 0", "\"vlan\": \"0\""), "must be an integer"},
      {"out of range", replaced("\"vlan\": 0", "\"vlan\": 4096"), "must be 0 to 4095"},
      {"negative", replaced("\"mtu\": 1500", "\"mtu\": -1500"), "must be 1280 to 9000"},
      {"policy incomplete", replaced("\"maxActive\": 1", "\"maxactive\": 1"),
       "lacks \"maxActive\""},
      {"duplicate row", replaced("\"name\": \"pnic5\"", "\"name\": \"pnic4\""),
       "repeats the key of an earlier row"},
      {"dangling port group",
       replaced("\"switch\": \"vswitch0\",\n        \"seq\": 7",
                "\"switch\": \"gone\",\n        \"seq\": 7"),
       "belongs to switch gone"},
      {"dangling DVPort client",
       replaced("\"port_id\": \"100\",\n        \"name\": \"vmA\"",
                "\"port_id\": \"999\",\n        \"name\": \"vmA\""),
       "client vmA is on DVPort 999, which does not exist"},
      {"pnic linked twice",
       replaced("\"pnic\": \"pnic1\",\n        \"dvs\": \"dvs0\"",
                "\"pnic\": \"pnic0\",\n        \"dvs\": \"dvs0\"", true),
       "pnic pnic0 is linked twice in the running state"},
      {"dangling uplink",
       replaced("\"uplinks\": [\n          \"pnic3\"", "\"uplinks\": [\n \"pnicX\""),
       "uplink pnicX of opaque switch opq0 is not a pnic"},
      {"counter behind", counterAt("3"), "is not beyond the largest seq"},
      {"counter not a number", counterAt("x"), "\"next_seq\" is not a number"},
  };
  for (const auto& c : cases) {
    const std::string message = Refusal([&] { host.Load(c.text); });
    EXPECT_NE(message.find(c.message), std::string::npos) << c.what << ": " << message;
    EXPECT_EQ(host.Dump(), good) << c.what;
  }
}

}  // namespace
