// Snapshots: named copies of a whole host, kept in a folder beside its file
// (PATH.snapshots/NAME), each a host file by itself. Saved and restored
// under the host's lock; a restore copies the snapshot's pages over the
// host's, in one commit.
#pragma once

#include <memory>
#include <string>
#include <vector>

namespace TarnCtl::Store {
class Db;
}

namespace TarnCtl::Admin {

class Host;

// Snapshot names: 1 to kSnapshotNameMax bytes, no '/', no control
// character, not starting with '.'.
inline constexpr size_t kSnapshotNameMax = 64;
// Why `name` cannot name a snapshot; empty when it can.
std::string SnapshotNameProblem(const std::string& name);

// The folder of the snapshots of the host file `hostPath`.
std::string SnapshotFolder(const std::string& hostPath);
// The snapshots' names, in byte order.
std::vector<std::string> Snapshots(const std::string& hostPath);
bool HasSnapshot(const std::string& hostPath, const std::string& name);

// Keeps the host open in `db` as snapshot `name` (replacing one of that
// name).
void SaveSnapshot(Store::Db& db, const std::string& hostPath, const std::string& name);
// Makes `host` snapshot `name` again, in one commit of its own after what
// the host's run did so far.
void RestoreSnapshot(Host& host, const std::string& name);
void RemoveSnapshot(const std::string& hostPath, const std::string& name);
// Snapshot `name`, opened to be read only.
std::unique_ptr<Store::Db> OpenSnapshot(const std::string& hostPath, const std::string& name);

// A whole copy of the host in `db` in a new file `file` (tarnhost try).
void CopyHost(Store::Db& db, const std::string& file);

}  // namespace TarnCtl::Admin
