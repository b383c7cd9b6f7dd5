// Host services the library runs on: the trace facility (TRC1) and the operating
// system layer (OSL1). On Linux both are implemented here over stdio and pthreads.
#pragma once
#include <pthread.h>

#include <atomic>
#include <cstddef>
#include <cstdint>

// ---- Trace facility -------------------------------------------------------------
// Flags: 0x08 detail, 0x10 state, 0x40 flow (entry/exit), 0x80 errors, 0x100 service.
// Configuration comes from the environment: "TRC1_FLAGS" is a comma-separated list of
// [module=]flags (numbers in C notation; a bare number applies to every module) and
// "TRC1_FILE" names a file to append to (standard error when unset).
struct TRC1_Record {
  const char *component;
  const char *module;
  std::atomic<uint32_t> flags;
  std::atomic<uint32_t> generation;
};

enum : uint32_t {
  TRC1_DETAIL = 0x08,
  TRC1_STATE = 0x10,
  TRC1_FLOW = 0x40,
  TRC1_ERROR = 0x80,
  TRC1_SERVICE = 0x100,
};

extern std::atomic<uint32_t> TRC1_generation;

void TRC1_Sync(TRC1_Record *record);
void TRC1_Event(TRC1_Record *record, int kind, int line, const char *function, long value);
void TRC1_Printf(TRC1_Record *record, const char *format, ...) __attribute__((format(printf, 2, 3)));
void TRC1_Dump(TRC1_Record *record, const char *title, const void *data, size_t length);
// Re-reads the environment (or takes the given texts when not null) and bumps the
// generation so that every record refreshes its flags on its next use.
void TRC1_Configure(const char *flags, const char *file);

// ---- Operating-system services ---------------------------------------------------
struct OSL1_Lock {
  pthread_mutex_t mutex;
};
int OSL1_InitializeLock(OSL1_Lock *lock);
int OSL1_GetLock(OSL1_Lock *lock);
int OSL1_ReleaseLock(OSL1_Lock *lock);
int OSL1_DestroyLock(OSL1_Lock *lock);
const char *OSL1_GetEnv(const char *name);

// A per-process or per-thread block: the host allocates blockSize bytes (zeroed), runs
// init once (per process, or per thread) and term when the process or thread ends.
struct OSL1_Descriptor {
  uint32_t blockSize;
  void (*init)(void *block);
  void (*term)(void *block);
  void *resolved;  // the process block once resolved
  pthread_key_t key;
  pthread_once_t once;
  std::atomic<int> keyReady;
};
void *OSL1_ResolveProcess(OSL1_Descriptor *descriptor, const char *module, int line);
void *OSL1_ResolveThread(OSL1_Descriptor *process, OSL1_Descriptor *thread, const char *module,
                         int line);
