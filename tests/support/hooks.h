// Counting allocation hooks with fault injection, and a scope that runs the library.
#pragma once
#include <cstddef>
#include <cstdint>
#include <string>

#include "veltrin.h"

namespace ts {

struct HookStats {
  long allocs = 0;
  long frees = 0;
  long live = 0;
  long failAt = -1;   // the allocation number (1-based) that fails; -1 none
  bool failed = false;
};
extern HookStats hooks;

void *countingAlloc(uint32_t context, size_t size);
int countingFree(uint32_t context, void *p);
void resetHooks(long failAt = -1);

// VLInit on entry with the counting hooks, VLTerm on exit.
struct Library {
  uint32_t rc;
  explicit Library(const char *dir, uint32_t options = 0) {
    resetHooks();
    rc = VLInit(dir, countingAlloc, countingFree, 7, options);
  }
  ~Library() { VLTerm(); }
  Library(const Library &) = delete;
  Library &operator=(const Library &) = delete;
};

}  // namespace ts
