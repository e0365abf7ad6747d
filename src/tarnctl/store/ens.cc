#include "tarnctl/store/ens.h"

#include "tarnctl/store/db.h"

namespace TarnCtl::Store::Ens {

bool IsActive(Db& db, const std::string& portset) {
  return db.Prepare("SELECT 1 FROM ens WHERE portset = ?").Bind(1, portset).Step();
}

void Activate(Db& db, const Active& ens) {
  db.Prepare("INSERT OR REPLACE INTO ens(portset, intr, fast_switch) VALUES (?, ?, ?)")
      .Bind(1, ens.portset)
      .Bind(2, ens.intr ? 1 : 0)
      .Bind(3, ens.fastSwitch ? 1 : 0)
      .Run();
}

void Deactivate(Db& db, const std::string& portset) {
  db.Prepare("DELETE FROM ens WHERE portset = ?").Bind(1, portset).Run();
}

std::vector<Active> List(Db& db) {
  std::vector<Active> active;
  auto select = db.Prepare("SELECT portset, intr, fast_switch FROM ens ORDER BY portset");
  while (select.Step()) active.push_back({select.Text(0), select.Int(1) != 0, select.Int(2) != 0});
  return active;
}

void AddReassociation(Db& db, const std::string& portset, bool mode, bool force, int64_t seq) {
  db.Prepare("INSERT INTO ens_event(seq, portset, mode, force) VALUES (?, ?, ?, ?)")
      .Bind(1, seq)
      .Bind(2, portset)
      .Bind(3, mode ? 1 : 0)
      .Bind(4, force ? 1 : 0)
      .Run();
}

std::vector<std::string> EventTexts(Db& db) {
  std::vector<std::string> texts;
  // Both kinds of events draw their seq from the one counter: merge them.
  auto select = db.Prepare(
      "SELECT seq, 'DVPort ' || dvs || ' port ' || port_id || ': ' || kind FROM dvport_event"
      " UNION ALL SELECT seq, 'ENS reassociation on ' || portset || ': mode ' || mode ||"
      " ', force ' || force FROM ens_event ORDER BY 1");
  while (select.Step()) texts.push_back(select.Text(1));
  return texts;
}

}  // namespace TarnCtl::Store::Ens
