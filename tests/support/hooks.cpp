#include "support/hooks.h"

#include <cstdlib>
#include <mutex>
#include <set>

namespace ts {

HookStats hooks;
namespace {
std::mutex g_mutex;
std::set<void *> &liveBlocks() {
  static std::set<void *> s;
  return s;
}
}  // namespace

void *countingAlloc(uint32_t, size_t size) {
  std::lock_guard<std::mutex> lock(g_mutex);
  ++hooks.allocs;
  if (hooks.allocs == hooks.failAt) {
    hooks.failed = true;
    return nullptr;
  }
  void *p = std::malloc(size ? size : 1);
  if (p) {
    ++hooks.live;
    liveBlocks().insert(p);
  }
  return p;
}

int countingFree(uint32_t, void *p) {
  if (!p) return 1;
  std::lock_guard<std::mutex> lock(g_mutex);
  // A block the hooks never gave out must not come back through them.
  if (!liveBlocks().erase(p)) std::abort();
  ++hooks.frees;
  --hooks.live;
  std::free(p);
  return 1;
}

void resetHooks(long failAt) {
  hooks = HookStats{};
  hooks.failAt = failAt;
}

}  // namespace ts
