#include "tarnctl/admin/snapshots.h"

#include <dirent.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "tarnctl/admin/host.h"
#include "tarnctl/instrument/call.h"
#include "tarnctl/instrument/errors.h"
#include "tarnctl/store/db.h"

namespace TarnCtl::Admin {

namespace {

std::string FileOf(const std::string& hostPath, const std::string& name) {
  return SnapshotFolder(hostPath) + "/" + name;
}

// The file of an existing snapshot; refuses a name that none has.
std::string Existing(const std::string& hostPath, const std::string& name) {
  if (!HasSnapshot(hostPath, name)) {
    throw Instrument::Refused("No snapshot named " + name, "(tarnhost snapshot list lists them)");
  }
  return FileOf(hostPath, name);
}

[[noreturn]] void Failed(const std::string& what, const std::string& file) {
  throw HostCtl::Lib::HostCtlException("cannot " + what + " " + file + ": " + std::strerror(errno),
                                       "");
}

}  // namespace

std::string SnapshotNameProblem(const std::string& name) {
  if (name.empty()) return "is empty";
  if (name.size() > kSnapshotNameMax) {
    return "is longer than " + std::to_string(kSnapshotNameMax) + " bytes";
  }
  if (name[0] == '.') return "starts with '.'";
  for (const unsigned char c : name) {
    if (c == '/') return "contains '/'";
    if (c < 0x20 || c == 0x7f) return "contains a control character";
  }
  return "";
}

std::string SnapshotFolder(const std::string& hostPath) {
  return hostPath + ".snapshots";
}

std::vector<std::string> Snapshots(const std::string& hostPath) {
  std::vector<std::string> names;
  DIR* folder = opendir(SnapshotFolder(hostPath).c_str());
  if (folder == nullptr) {
    if (errno == ENOENT) return names;
    Failed("read the snapshot folder", SnapshotFolder(hostPath));
  }
  while (const dirent* entry = readdir(folder)) {
    const std::string name = entry->d_name;
    // Copies being written end in ".new" and start no name ('.' cannot).
    if (SnapshotNameProblem(name).empty() &&
        !(name.size() > 4 && name.compare(name.size() - 4, 4, ".new") == 0)) {
      names.push_back(name);
    }
  }
  closedir(folder);
  std::sort(names.begin(), names.end());
  return names;
}

bool HasSnapshot(const std::string& hostPath, const std::string& name) {
  struct stat info;
  return SnapshotNameProblem(name).empty() && stat(FileOf(hostPath, name).c_str(), &info) == 0 &&
         S_ISREG(info.st_mode);
}

void SaveSnapshot(Store::Db& db, const std::string& hostPath, const std::string& name) {
  const std::string folder = SnapshotFolder(hostPath);
  if (mkdir(folder.c_str(), 0777) != 0 && errno != EEXIST) Failed("create", folder);
  CopyHost(db, FileOf(hostPath, name));
}

void RestoreSnapshot(Host& host, const std::string& name) {
  const std::string file = Existing(host.Path(), name);
  Instrument::Scope scope(host.db(), "Restore");
  host.ReplaceWith(file);
}

void RemoveSnapshot(const std::string& hostPath, const std::string& name) {
  const std::string file = Existing(hostPath, name);
  if (unlink(file.c_str()) != 0) Failed("remove", file);
}

std::unique_ptr<Store::Db> OpenSnapshot(const std::string& hostPath, const std::string& name) {
  return Store::Db::OpenFile(Existing(hostPath, name), "snapshot " + name,
                             Store::Db::Access::kRead);
}

void CopyHost(Store::Db& db, const std::string& file) {
  db.CopyTo(file);
}

}  // namespace TarnCtl::Admin
