// The rules, on a host in memory: names, ranges and words, and the
// invariants a host from outside is held to.
#include "scratch.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/model/invariants.h"
#include "tarnctl/model/limits.h"
#include "tarnctl/model/names.h"
#include "tarnctl/model/words.h"
#include "tarnctl/store/host_file.h"

namespace {

using namespace TarnCtl;
using Model::NameKind;

class ModelTest : public ::testing::Test {
 protected:
  ModelTest() : host_(Store::HostFile::Open(Store::Location::Memory(), {})), scope_(db(), "Rule") {}
  Store::Db& db() { return host_->db(); }

  std::unique_ptr<Store::HostFile> host_;
  Instrument::Scope scope_;
};

TEST_F(ModelTest, NamesAreShortPrintableTextWithoutCommasWhereListed) {
  const std::string c1 =
      "a\xc2\x9b"
      "b";  // a terminal's one-byte CSI, as UTF-8
  const struct {
    NameKind kind;
    std::string name;
    std::string refusal;
  } cases[] = {
      {NameKind::kSwitch, std::string(31, 's'), ""},
      {NameKind::kSwitch, std::string(32, 's'),
       "Rule: Virtual switch name " + std::string(32, 's') + " is too long (at most 31 bytes)"},
      {NameKind::kPnic, "", "Rule: Pnic name is empty"},
      {NameKind::kPnic, "c,d",
       "Rule: Pnic name c,d contains a comma (such names are listed comma-separated)"},
      {NameKind::kPortGroup, "c,d", ""},
      {NameKind::kPortGroup, "pg\nRemovePortGroup",
       "Rule: Portgroup name contains a control character (byte 3)"},
      {NameKind::kClient, "vm\x1b[2J", "Rule: Client name contains a control character (byte 3)"},
      {NameKind::kDVPort, c1, "Rule: DVPort id contains a control character (byte 2)"},
      {NameKind::kUplink, "\xff", "Rule: Uplink name is not valid UTF-8 text"},
      {NameKind::kPortset, "\xc3\xa9t\xc3\xa9", ""},
      {NameKind::kSwitchId, "\xed\xa0\x80", "Rule: Switch id is not valid UTF-8 text"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(Refused([&] { Model::CheckName(c.kind, c.name); }).second, c.refusal) << c.name;
  }
  EXPECT_EQ(Refused([&] { Model::CheckNewSwitchName(db(), NameKind::kSwitch, "vswitch0"); }).second,
            "Rule: Virtual switch vswitch0 already exists on this host");
  EXPECT_EQ(Refused([&] { Model::CheckFreePnic(db(), "pnic0"); }).second,
            "Rule: pnic0 is already linked to vswitch0");
}

TEST_F(ModelTest, RangesAndWordsSayWhatTheyAccept) {
  const struct {
    const Model::Range& range;
    int64_t value;
    const char* refusal;
  } cases[] = {
      {Model::kPorts, 8, ""},
      {Model::kPorts, 7, "Rule: Invalid number of ports 7 (8-4096)"},
      {Model::kPorts, 4097, "Rule: Invalid number of ports 4097 (8-4096)"},
      {Model::kMtu, 9000, ""},
      {Model::kMtu, 9001, "Rule: MTU 9001 is out of range (1280-9000)"},
      {Model::kCdpStatus, -1, "Rule: Invalid CDP status -1 (0-3)"},
      {Model::kMaxActive, -1, "Rule: Invalid max active uplinks -1 (it must be 0 or more)"},
      {Model::kDvsVersion, -1, "Rule: Invalid DVS version -1"},
  };
  for (const auto& c : cases) {
    EXPECT_EQ(Refused([&] { Model::Check(c.range, c.value); }).second, c.refusal) << c.value;
  }
  EXPECT_EQ(Refused([] { Model::Check(Model::kUsedPorts, 9, 8); }).second,
            "Rule: Invalid number of used ports 9 (0-8)");
  EXPECT_EQ(Refused([] { Model::CdpStatusOfWord("Both"); }).second,
            "Rule: Unknown CDP status Both (expected down, listen, advertise or both)");
  EXPECT_EQ(Model::CdpWord(2), "advertise");
  EXPECT_EQ(Model::CdpWord(7), "7");
  EXPECT_TRUE(Model::IsUuidText(Model::UuidOfName("a longer name than fifteen")));
  EXPECT_FALSE(Model::IsUuidText(Model::UuidOfName("x") + " "));
}

// Each invariant, broken on purpose, is found and said in words.
TEST_F(ModelTest, InvariantsFindTheFirstOffender) {
  const struct {
    const char* sql;
    const char* violation;
  } cases[] = {
      {"UPDATE portgroup SET switch = 'gone' WHERE layer = 0",
       "port group Management belongs to switch gone, which does not exist in the stored "
       "configuration"},
      {"DELETE FROM pnic WHERE name = 'pnic0'", "pnic pnic0, linked to vswitch0, does not exist"},
      {"INSERT INTO opaque VALUES ('op', 'op', 8, 0, '[\"pnic0\"]', 9)",
       "pnic pnic0 is used by two switches of the running state"},
      {"INSERT INTO opaque VALUES ('vswitch0', 'op', 8, 0, '[]', 9)",
       "switch or portset name vswitch0 is used twice in the running state"},
      {"UPDATE vswitch SET num_ports = 8; WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 "
       "FROM n WHERE i < 8) INSERT INTO client SELECT 'Management', 'vm' || i, 100 + i FROM n",
       "switch vswitch0 has 9 ports in use but only 8 ports"},
      {"INSERT INTO ens VALUES ('nosuch', 0, 0)",
       "ENS is active on nosuch, which is no running portset"},
  };
  for (const auto& c : cases) {
    db().Exec(std::string("SAVEPOINT t;") + c.sql);
    EXPECT_EQ(Model::FirstViolation(db()).value_or(""), c.violation) << c.sql;
    db().Exec("ROLLBACK TO t; RELEASE t");
  }
}

}  // namespace
