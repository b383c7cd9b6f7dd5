// Shared machinery of the library: the global area, memory through the hooks,
// tracing, the lock, and unaligned native reads.
#pragma once
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <type_traits>
#include <utility>

#include "frame/host.h"
#include "veltrin.h"

struct VLGlobals {
  uint32_t allocContext;
  uint16_t initCount;
  OSL1_Lock lock;
  uint32_t fileContext;
  VLObjManager *objManager;
  uint32_t level;
  char pathSeparator[2];
  char nameSeparator[2];
};

struct VLFile {
  int32_t descriptor;
  uint8_t mode;
  uint8_t isTemp;
  uint8_t isWrite;
  uint8_t atEnd;
  // Writing over an existing file: the file's name and the temporary's, in one block.
  char *finalName;
  char *tempName;
};

namespace vl {

// Alignment of variable tables inside bodies built or converted by the library.
constexpr size_t kAlign = 8;

inline uint32_t allocContext() { return vlglobals ? vlglobals->allocContext : 0; }
inline void *alloc(size_t n) {
  VLAllocHook h = vlalloc_cbk ? vlalloc_cbk : VLDefAlloc;
  return h(allocContext(), n);
}
inline void *allocZero(size_t n) {
  void *p = alloc(n);
  if (p) std::memset(p, 0, n);
  return p;
}
// True when the block went back (or was null).
inline bool release(void *p) {
  if (!p) return true;
  VLFreeHook h = vlfree_cbk ? vlfree_cbk : VLDefFree;
  return h(allocContext(), p) != 0;
}

// Owns one hook-allocated block until released or handed over.
template <class T>
class Block {
 public:
  Block() = default;
  explicit Block(T *p) : p_(p) {}
  explicit Block(size_t bytes) : p_(static_cast<T *>(alloc(bytes))) {}
  Block(const Block &) = delete;
  Block &operator=(const Block &) = delete;
  Block(Block &&o) noexcept : p_(std::exchange(o.p_, nullptr)) {}
  ~Block() { release(p_); }
  T *get() const { return p_; }
  T *operator->() const { return p_; }
  explicit operator bool() const { return p_ != nullptr; }
  T *take() { return std::exchange(p_, nullptr); }

 private:
  T *p_ = nullptr;
};

// Holds the global lock for a scope.
class LockGuard {
 public:
  explicit LockGuard(OSL1_Lock *l) : l_(l) {
    if (l_) OSL1_GetLock(l_);
  }
  ~LockGuard() {
    if (l_) OSL1_ReleaseLock(l_);
  }
  LockGuard(const LockGuard &) = delete;
  LockGuard &operator=(const LockGuard &) = delete;

 private:
  OSL1_Lock *l_;
};

// Native reads and writes at any alignment; bodies hold native integers after loading.
inline uint16_t rd16(const void *p) {
  uint16_t v;
  std::memcpy(&v, p, 2);
  return v;
}
inline uint32_t rd32(const void *p) {
  uint32_t v;
  std::memcpy(&v, p, 4);
  return v;
}
inline void wr16(void *p, uint16_t v) { std::memcpy(p, &v, 2); }
inline void wr32(void *p, uint32_t v) { std::memcpy(p, &v, 4); }
// Big-endian reads, for data as the files hold it.
inline uint16_t be16(const void *p) { return __builtin_bswap16(rd16(p)); }
inline uint32_t be32(const void *p) { return __builtin_bswap32(rd32(p)); }

inline VLLocale *orDefault(VLLocale *l) { return l ? l : vlglocale; }
// Stores a code in the handle (when there is one) and gives it back.
inline uint32_t setRc(VLLocale *l, uint32_t rc) {
  if (l) l->lastError = static_cast<int32_t>(rc);
  return rc;
}

// ---- Tracing --------------------------------------------------------------------
class Tracer {
 public:
  explicit constexpr Tracer(const char *module) : rec_{"Veltrin", module, {0}, {0}} {}
  uint32_t flags() {
    if (rec_.generation.load(std::memory_order_acquire) != TRC1_generation.load(std::memory_order_relaxed))
      TRC1_Sync(&rec_);
    return rec_.flags.load(std::memory_order_relaxed);
  }
  bool on(uint32_t f) { return (flags() & f) != 0; }
  TRC1_Record *record() { return &rec_; }

 private:
  TRC1_Record rec_;
};

// Entry and exit events of one function call.
class Flow {
 public:
  Flow(Tracer &t, const char *fn, int line) : t_(t), fn_(fn), line_(line), on_(t.on(TRC1_FLOW)) {
    if (on_) TRC1_Event(t_.record(), 0, line_, fn_, 0);
  }
  ~Flow() {
    if (on_ && !done_) TRC1_Event(t_.record(), 2, line_, fn_, 0);
  }
  template <class T>
  T ret(T v) {
    if (on_) {
      done_ = true;
      long shown;
      if constexpr (std::is_pointer_v<T>)
        shown = reinterpret_cast<long>(v);
      else
        shown = static_cast<long>(v);
      TRC1_Event(t_.record(), 1, line_, fn_, shown);
    }
    return v;
  }
  Flow(const Flow &) = delete;
  Flow &operator=(const Flow &) = delete;

 private:
  Tracer &t_;
  const char *fn_;
  int line_;
  bool on_;
  bool done_ = false;
};

}  // namespace vl

// One trace record per source file, and the calls that follow the trace convention.
#define VL_TRACE_MODULE(name) static vl::Tracer vl_trc(name)
#define VL_FLOW(fn) vl::Flow vl_flow(vl_trc, fn, __LINE__)
#define VL_RET(v) return vl_flow.ret(v)
#define VL_TRACE(flag, ...)                                  \
  do {                                                       \
    if (vl_trc.on(flag)) TRC1_Printf(vl_trc.record(), __VA_ARGS__); \
  } while (0)
#define VL_ERR(...) VL_TRACE(TRC1_ERROR, __VA_ARGS__)
#define VL_STATE(...) VL_TRACE(TRC1_STATE, __VA_ARGS__)
#define VL_DETAIL(...) VL_TRACE(TRC1_DETAIL, __VA_ARGS__)
