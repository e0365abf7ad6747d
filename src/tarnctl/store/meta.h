// The host's counters and flags (table meta).
#pragma once

#include <cstdint>
#include <optional>
#include <string>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Meta {

// The next value of the ordering counter that every `seq` column draws
// from. REQUIRES: inside a transaction.
int64_t NextSeq(Db& db);

// Whether the ENS activation node was set since boot.
bool EnsNodeSet(Db& db);
void SetEnsNode(Db& db, uint32_t value);

// The text of any key, as a dump carries it; nothing when the host has none.
std::optional<std::string> Value(Db& db, const std::string& key);
void SetValue(Db& db, const std::string& key, const std::string& value);

}  // namespace TarnCtl::Store::Meta
