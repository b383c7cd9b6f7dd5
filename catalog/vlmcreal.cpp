// Resizes a catalog block; the hooks have no resize of their own, so the old size is given.
#include "catalog/catalog.h"

void *VLMcRealloc(void *block, size_t oldSize, size_t newSize) {
  void *p = vl::alloc(newSize ? newSize : 1);
  if (!p) return nullptr;  // the old block stays the caller's
  if (block) std::memcpy(p, block, oldSize < newSize ? oldSize : newSize);
  vl::release(block);
  return p;
}
