#include "tarnctl/store/host_vfs.h"

#include <sqlite3.h>
#include <unistd.h>

namespace TarnCtl::Store {

namespace {

constexpr const char* kName = "tarnhost";

sqlite3_vfs g_vfs;
const sqlite3_vfs* g_system = nullptr;

// The system layer's methods for a host file, and the same with the log's
// header left to be synced with its frames. REQUIRES: the system layer uses
// one set of methods for the main files it opens (the checked fallback
// leaves any other set alone).
const sqlite3_io_methods* g_systemMethods = nullptr;
sqlite3_io_methods g_trustedMethods;

int TrustedCharacteristics(sqlite3_file* file) {
  return g_systemMethods->xDeviceCharacteristics(file) | SQLITE_IOCAP_SEQUENTIAL;
}

// Opens an existing log without asking to create it: a file opened with
// the create flag has its directory synced at its first sync.
int Open(sqlite3_vfs*, const char* name, sqlite3_file* file, int flags, int* outFlags) {
  auto* system = const_cast<sqlite3_vfs*>(g_system);
  if ((flags & SQLITE_OPEN_WAL) != 0 && name != nullptr && access(name, F_OK) == 0) {
    const int rc = system->xOpen(system, name, file, flags & ~SQLITE_OPEN_CREATE, outFlags);
    if (rc != SQLITE_CANTOPEN) return rc;  // else removed meanwhile: create it
  }
  return system->xOpen(system, name, file, flags, outFlags);
}

sqlite3_file* MainFile(sqlite3* db) {
  sqlite3_file* file = nullptr;
  if (sqlite3_file_control(db, "main", SQLITE_FCNTL_FILE_POINTER, &file) != SQLITE_OK) {
    return nullptr;
  }
  return file != nullptr && file->pMethods != nullptr ? file : nullptr;
}

}  // namespace

const char* HostVfsName() {
  static const bool registered = [] {
    g_system = sqlite3_vfs_find(nullptr);
    g_vfs = *g_system;
    g_vfs.pNext = nullptr;
    g_vfs.zName = kName;
    g_vfs.xOpen = Open;
    sqlite3_vfs_register(&g_vfs, 0);
    return true;
  }();
  (void)registered;
  return kName;
}

void TrustLog(sqlite3* db) {
  sqlite3_file* file = MainFile(db);
  if (file == nullptr) return;
  if (g_systemMethods == nullptr) {
    g_systemMethods = file->pMethods;
    g_trustedMethods = *file->pMethods;
    g_trustedMethods.xDeviceCharacteristics = TrustedCharacteristics;
  }
  if (file->pMethods == g_systemMethods) file->pMethods = &g_trustedMethods;
}

void DistrustLog(sqlite3* db) {
  sqlite3_file* file = MainFile(db);
  if (file != nullptr && file->pMethods == &g_trustedMethods) file->pMethods = g_systemMethods;
}

}  // namespace TarnCtl::Store
