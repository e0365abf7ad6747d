#include "tarnctl/store/host_vfs.h"

#include <fcntl.h>
#include <sqlite3.h>
#include <unistd.h>

namespace TarnCtl::Store {

namespace {

constexpr const char* kName = "tarnhost";

sqlite3_vfs g_vfs;
const sqlite3_vfs* g_system = nullptr;
uint64_t g_ioFailures = 0;

// The system layer's methods for the files it opens, the same watched for
// failures, and those with the log's header left to be synced with its
// frames. REQUIRES: the system layer uses one set of methods for the files
// it opens (the checked fallback leaves any other set alone).
const sqlite3_io_methods* g_systemMethods = nullptr;
sqlite3_io_methods g_watchedMethods;
sqlite3_io_methods g_trustedMethods;

int Watch(int rc) {
  if (rc != SQLITE_OK && rc != SQLITE_IOERR_SHORT_READ && rc != SQLITE_BUSY) ++g_ioFailures;
  return rc;
}

int Read(sqlite3_file* file, void* buffer, int amount, sqlite3_int64 offset) {
  return Watch(g_systemMethods->xRead(file, buffer, amount, offset));
}
int Write(sqlite3_file* file, const void* buffer, int amount, sqlite3_int64 offset) {
  return Watch(g_systemMethods->xWrite(file, buffer, amount, offset));
}
int Truncate(sqlite3_file* file, sqlite3_int64 size) {
  return Watch(g_systemMethods->xTruncate(file, size));
}
int Sync(sqlite3_file* file, int flags) {
  return Watch(g_systemMethods->xSync(file, flags));
}
int FileSize(sqlite3_file* file, sqlite3_int64* size) {
  return Watch(g_systemMethods->xFileSize(file, size));
}
int TrustedCharacteristics(sqlite3_file* file) {
  return g_systemMethods->xDeviceCharacteristics(file) | SQLITE_IOCAP_SEQUENTIAL;
}

void Adopt(sqlite3_file* file) {
  if (g_systemMethods == nullptr) {
    g_systemMethods = file->pMethods;
    g_watchedMethods = *file->pMethods;
    g_watchedMethods.xRead = Read;
    g_watchedMethods.xWrite = Write;
    g_watchedMethods.xTruncate = Truncate;
    g_watchedMethods.xSync = Sync;
    g_watchedMethods.xFileSize = FileSize;
    g_trustedMethods = g_watchedMethods;
    g_trustedMethods.xDeviceCharacteristics = TrustedCharacteristics;
  }
  if (file->pMethods == g_systemMethods) file->pMethods = &g_watchedMethods;
}

int OpenFile(sqlite3_vfs* system, const char* name, sqlite3_file* file, int flags, int* outFlags) {
  int opened = 0;
  const int rc = system->xOpen(system, name, file, flags, &opened);
  if (outFlags != nullptr) *outFlags = opened;
  if (rc != SQLITE_OK) return Watch(rc);
  // Asked to write, given only reading: SQLite's fallback after a failed
  // read-write open. Unless the file is positively not writable, that
  // failure was an I/O error, and reading on would hide it.
  if ((flags & SQLITE_OPEN_READWRITE) != 0 && (opened & SQLITE_OPEN_READONLY) != 0 &&
      name != nullptr && access(name, W_OK) == 0) {
    if (file->pMethods != nullptr) file->pMethods->xClose(file);
    file->pMethods = nullptr;
    return Watch(SQLITE_IOERR);
  }
  if (file->pMethods != nullptr) Adopt(file);
  return rc;
}

// Opens an existing log without asking to create it: a file opened with
// the create flag has its directory synced at its first sync.
int Open(sqlite3_vfs*, const char* name, sqlite3_file* file, int flags, int* outFlags) {
  auto* system = const_cast<sqlite3_vfs*>(g_system);
  if ((flags & SQLITE_OPEN_WAL) != 0 && name != nullptr && access(name, F_OK) == 0) {
    const int rc = OpenFile(system, name, file, flags & ~SQLITE_OPEN_CREATE, outFlags);
    if (rc != SQLITE_CANTOPEN) return rc;  // else removed meanwhile: create it
  }
  return OpenFile(system, name, file, flags, outFlags);
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
  if (file != nullptr && file->pMethods == &g_watchedMethods) file->pMethods = &g_trustedMethods;
}

void DistrustLog(sqlite3* db) {
  sqlite3_file* file = MainFile(db);
  if (file != nullptr && file->pMethods == &g_trustedMethods) file->pMethods = &g_watchedMethods;
}

uint64_t IoFailures() {
  return g_ioFailures;
}

}  // namespace TarnCtl::Store
