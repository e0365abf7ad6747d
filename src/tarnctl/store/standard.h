// Standard switches (table vswitch) and their links to pnics (table link).
// Changes the library makes to a standard switch go to both layers.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "tarnctl/store/layer.h"

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Standard {

struct Row {
  uint32_t numPorts = 0;
  uint32_t mtu = 0;
  int32_t cdp = 0;
  bool system = false;
  std::string policy;  // policy_codec.h, stored form

  bool operator==(const Row&) const = default;
};

struct Named {
  std::string name;
  Row row;
};

std::optional<Row> Find(Db& db, Layer layer, const std::string& name);
bool Exists(Db& db, Layer layer, const std::string& name);
void Insert(Db& db, Layer layer, const std::string& name, int64_t seq, const Row& row);
// The switches of `layer` with that system flag, in the order they were made.
std::vector<Named> List(Db& db, Layer layer, bool system);
// Every switch of `layer`, system ones included, in the order they were made.
std::vector<Named> ListAll(Db& db, Layer layer);

// In both layers.
void SetPolicy(Db& db, const std::string& name, const std::string& policy);
void SetCdp(Db& db, const std::string& name, int32_t cdp);
void SetMtu(Db& db, const std::string& name, uint32_t mtu);

// Drops the stored switch `name` with its stored port groups and links.
void DeleteStored(Db& db, const std::string& name);
// Drops the switch from both layers with its port groups, links and ENS.
void Delete(Db& db, const std::string& name);

// Clients of the running port groups of the switch.
int64_t ClientCount(Db& db, const std::string& name);
// Running links plus ClientCount.
int64_t UsedPorts(Db& db, const std::string& name);

// Links.
bool Linked(Db& db, Layer layer, const std::string& pnic, const std::string& name);
void Link(Db& db, Layer layer, const std::string& pnic, const std::string& name, int64_t seq);
// Unlinks from the stored configuration only, or from both layers.
void Unlink(Db& db, const std::string& pnic, const std::string& name, bool storedOnly);
// The pnics linked in `layer`, in the order they were linked.
std::vector<std::string> Uplinks(Db& db, Layer layer, const std::string& name);
// Stored links of the switch that the running state lacks: pnic and seq.
std::vector<std::pair<std::string, int64_t>> UnrestoredLinks(Db& db, const std::string& name);

}  // namespace TarnCtl::Store::Standard
