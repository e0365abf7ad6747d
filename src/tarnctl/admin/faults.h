// Faults armed on the library's operations: added, removed by number,
// cleared; one reading, printed as text, JSON and rows. Fault texts are
// free bytes: the text and the rows show them quoted and escaped as the
// call trace writes strings, so that each stays on its line and field.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "tarnctl/admin/view.h"
#include "tarnctl/store/faults.h"

namespace TarnCtl::Admin {

using Fault = Store::Faults::Row;

struct FaultSeed {
  std::string operation;
  std::optional<std::string> on;  // object or argument name; none: any call
  std::optional<std::string> message;
  std::optional<std::string> detail;
  int64_t skip = 0;
  int64_t times = 1;
  int64_t delayMs = 0;
  bool pass = false;
  bool always = false;
};

// An operation of the host control library, for arming faults.
struct OperationInfo {
  std::string name;
  std::string target;  // what --on may name for it, in words
  bool faultable;      // false: it runs without the host and cannot fail
};
// Every operation of the library, in name order.
std::vector<OperationInfo> LibraryOperations();

// The armed faults, in the order they were armed.
std::vector<Fault> Faults(Store::Db& db);

void AddFault(Store::Db& db, const FaultSeed& seed);
// The fault of that number, as ListFaults shows it.
void RemoveFault(Store::Db& db, int64_t number);
void ClearFaults(Store::Db& db);

// Number, operation, object, skip, times, message, detail (quoted), delay
// (ms), pass, always, fired, and armed or spent; `armedOnly`: without the
// spent ones.
std::vector<ListRow> ListFaults(Store::Db& db, bool armedOnly = false);

std::string FaultText(const Fault& fault);
Json FaultJson(const Fault& fault);

}  // namespace TarnCtl::Admin
