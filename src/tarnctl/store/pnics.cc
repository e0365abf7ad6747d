#include "tarnctl/store/pnics.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Pnics {

bool Exists(Db& db, const std::string& name) {
  return db.Prepare("SELECT 1 FROM pnic WHERE name = ?").Bind(1, name).Step();
}

void Insert(Db& db, const std::string& name, int64_t seq) {
  db.Prepare("INSERT INTO pnic(seq, name) VALUES (?, ?)").Bind(1, seq).Bind(2, name).Run();
}

void Delete(Db& db, const std::string& name) {
  db.Prepare("DELETE FROM pnic WHERE name = ?").Bind(1, name).Run();
}

std::vector<std::string> Names(Db& db) {
  std::vector<std::string> names;
  auto select = db.Prepare("SELECT name FROM pnic ORDER BY seq");
  while (select.Step()) names.push_back(select.Text(0));
  return names;
}

std::optional<std::string> LinkedSwitch(Db& db, Layer layer, const std::string& pnic) {
  auto linked = db.Prepare(
      "SELECT switch FROM link WHERE layer = ?1 AND pnic = ?2"
      " UNION ALL SELECT dvs FROM dvs_uplink WHERE layer = ?1 AND pnic = ?2");
  if (!linked.Bind(1, LayerValue(layer)).Bind(2, pnic).Step()) return std::nullopt;
  return linked.Text(0);
}

std::optional<std::string> OpaqueHolder(Db& db, const std::string& pnic) {
  // Opaque switches are few and their uplinks a list inside the row.
  auto holder =
      db.Prepare("SELECT o.name FROM opaque o, json_each(o.uplinks) u WHERE u.value = ? LIMIT 1");
  if (!holder.Bind(1, pnic).Step()) return std::nullopt;
  return holder.Text(0);
}

}  // namespace TarnCtl::Store::Pnics
