// Whole-host changes: replacing the host, a reboot, and the restore of the
// stored configuration into the running state.
#pragma once

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Store::Reset {

// Replaces everything in the database with the default host (or, with
// `empty`, a host with nothing at all), built from this library's schema:
// whatever tables the file held, known or not, missing or extra, are
// dropped first. REQUIRES: inside a transaction.
void Rebuild(Db& db, bool empty);

// Drops the running state (switches, port groups, links, distributed
// switches and their uplinks, loaded timeouts), the ENS state and the ENS
// activation node.
void Reboot(Db& db);

// Copies the stored standard switches and port groups that the running
// state lacks (without links), leaving out switches whose names running
// switches of any kind have taken.
void RestoreStandard(Db& db);
// Copies the cached distributed switches and their uplinks that the
// running state lacks, leaving out switches whose names or ids running ones
// have taken and uplinks whose pnics are in use.
void RestoreDistributed(Db& db);

}  // namespace TarnCtl::Store::Reset
