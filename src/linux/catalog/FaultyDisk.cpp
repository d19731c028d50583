#include "linux/catalog/FaultyDisk.h"

#include <sqlite3.h>

#include <atomic>
#include <cstring>
#include <mutex>

namespace vantrell::linuxos {

namespace {

// A layer over the system's own file layer, for the whole process because SQLite takes the
// default layer when a database is opened by name.
std::atomic<int> callsLeft;
std::atomic<int> injected;
std::atomic<bool> goesOn;
std::atomic<int> failureCode;
std::atomic<bool> isInForce;

bool shouldFail() {
  if (!isInForce) return false;
  const int left = --callsLeft;
  const bool fails = left == 0 || (left < 0 && goesOn);
  if (fails) ++injected;
  return fails;
}

struct LayeredFile {
  sqlite3_file base;
  sqlite3_file* real;
};

sqlite3_file* realOf(sqlite3_file* file) { return reinterpret_cast<LayeredFile*>(file)->real; }

int closeFile(sqlite3_file* file) { return realOf(file)->pMethods->xClose(realOf(file)); }
int readFile(sqlite3_file* file, void* to, int size, sqlite3_int64 at) {
  return realOf(file)->pMethods->xRead(realOf(file), to, size, at);
}
int writeFile(sqlite3_file* file, const void* from, int size, sqlite3_int64 at) {
  if (shouldFail()) return failureCode;
  return realOf(file)->pMethods->xWrite(realOf(file), from, size, at);
}
int truncateFile(sqlite3_file* file, sqlite3_int64 size) {
  if (shouldFail()) return SQLITE_IOERR_TRUNCATE;
  return realOf(file)->pMethods->xTruncate(realOf(file), size);
}
int syncFile(sqlite3_file* file, int flags) {
  if (shouldFail()) return SQLITE_IOERR_FSYNC;
  return realOf(file)->pMethods->xSync(realOf(file), flags);
}
int fileSize(sqlite3_file* file, sqlite3_int64* size) {
  return realOf(file)->pMethods->xFileSize(realOf(file), size);
}
int lockFile(sqlite3_file* file, int level) {
  return realOf(file)->pMethods->xLock(realOf(file), level);
}
int unlockFile(sqlite3_file* file, int level) {
  return realOf(file)->pMethods->xUnlock(realOf(file), level);
}
int checkLock(sqlite3_file* file, int* isReserved) {
  return realOf(file)->pMethods->xCheckReservedLock(realOf(file), isReserved);
}
int controlFile(sqlite3_file* file, int operation, void* argument) {
  return realOf(file)->pMethods->xFileControl(realOf(file), operation, argument);
}
int sectorSize(sqlite3_file* file) { return realOf(file)->pMethods->xSectorSize(realOf(file)); }
int characteristics(sqlite3_file* file) {
  return realOf(file)->pMethods->xDeviceCharacteristics(realOf(file));
}
int mapShared(sqlite3_file* file, int page, int size, int extend, void volatile** memory) {
  return realOf(file)->pMethods->xShmMap(realOf(file), page, size, extend, memory);
}
int lockShared(sqlite3_file* file, int offset, int count, int flags) {
  return realOf(file)->pMethods->xShmLock(realOf(file), offset, count, flags);
}
void barrierShared(sqlite3_file* file) { realOf(file)->pMethods->xShmBarrier(realOf(file)); }
int unmapShared(sqlite3_file* file, int doDelete) {
  return realOf(file)->pMethods->xShmUnmap(realOf(file), doDelete);
}

const sqlite3_io_methods kMethods = {
    2,          closeFile,     readFile,    writeFile,   truncateFile, syncFile,        fileSize,
    lockFile,   unlockFile,    checkLock,   controlFile, sectorSize,   characteristics, mapShared,
    lockShared, barrierShared, unmapShared, nullptr,     nullptr};

sqlite3_vfs* systemLayer = nullptr;
sqlite3_vfs layer;

int openFile(sqlite3_vfs*, const char* name, sqlite3_file* file, int flags, int* outFlags) {
  auto* const layered = reinterpret_cast<LayeredFile*>(file);
  layered->base.pMethods = nullptr;
  layered->real = reinterpret_cast<sqlite3_file*>(layered + 1);
  const int code = systemLayer->xOpen(systemLayer, name, layered->real, flags, outFlags);
  if (layered->real->pMethods != nullptr) layered->base.pMethods = &kMethods;
  return code;
}

int deleteFile(sqlite3_vfs*, const char* name, int syncFolder) {
  if (shouldFail()) return SQLITE_IOERR_DELETE;
  return systemLayer->xDelete(systemLayer, name, syncFolder);
}

void install() {
  static std::once_flag once;
  std::call_once(once, [] {
    systemLayer = sqlite3_vfs_find(nullptr);
    layer = *systemLayer;
    layer.zName = "faulty";
    layer.szOsFile = static_cast<int>(sizeof(LayeredFile)) + systemLayer->szOsFile;
    layer.xOpen = openFile;
    layer.xDelete = deleteFile;
    sqlite3_vfs_register(&layer, 1);
  });
}

}  // namespace

FaultyDisk::FaultyDisk(int nth, Fault fault, int code) {
  install();
  callsLeft = nth;
  injected = 0;
  goesOn = fault == Fault::FromThenOn;
  failureCode = code;
  isInForce = true;
}

FaultyDisk::~FaultyDisk() { isInForce = false; }

int FaultyDisk::faultsInjected() const { return injected; }

}  // namespace vantrell::linuxos
