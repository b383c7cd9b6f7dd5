// Default free hook: the platform allocator.
#include <cstdlib>

#include "frame/frame.h"

int VLDefFree(uint32_t, void *block) {
  std::free(block);
  return 1;
}
