#include "tarnctl/store/opaque.h"

#include "tarnctl/store/db.h"
#include "tarnctl/store/policy_codec.h"

namespace TarnCtl::Store::Opaque {

namespace {

Row ReadRow(const Statement& select, int first) {
  return {select.Text(first), static_cast<uint32_t>(select.Int(first + 1)),
          static_cast<uint32_t>(select.Int(first + 2)), DecodeNameList(select.Text(first + 3))};
}

}  // namespace

std::optional<Row> Find(Db& db, const std::string& name) {
  auto select =
      db.Prepare("SELECT portset, num_ports, used_ports, uplinks FROM opaque WHERE name = ?");
  if (!select.Bind(1, name).Step()) return std::nullopt;
  return ReadRow(select, 0);
}

std::optional<std::string> NameOfPortset(Db& db, const std::string& portset) {
  auto select = db.Prepare("SELECT name FROM opaque WHERE portset = ?");
  if (!select.Bind(1, portset).Step()) return std::nullopt;
  return select.Text(0);
}

void Insert(Db& db, const std::string& name, int64_t seq, const Row& row) {
  db.Prepare(
        "INSERT INTO opaque(name, portset, num_ports, used_ports, uplinks, seq)"
        " VALUES (?, ?, ?, ?, ?, ?)")
      .Bind(1, name)
      .Bind(2, row.portset)
      .Bind(3, row.numPorts)
      .Bind(4, row.usedPorts)
      .Bind(5, EncodeNameList(row.uplinks))
      .Bind(6, seq)
      .Run();
}

void Delete(Db& db, const std::string& name) {
  db.Prepare("DELETE FROM opaque WHERE name = ?").Bind(1, name).Run();
}

std::vector<Named> List(Db& db) {
  std::vector<Named> switches;
  auto select = db.Prepare(
      "SELECT name, portset, num_ports, used_ports, uplinks FROM opaque ORDER BY seq, name");
  while (select.Step()) switches.push_back({select.Text(0), ReadRow(select, 1)});
  return switches;
}

}  // namespace TarnCtl::Store::Opaque
