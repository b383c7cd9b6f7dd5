// Default allocation hook: the platform allocator.
#include <cstdlib>

#include "frame/frame.h"

void *VLDefAlloc(uint32_t, size_t size) { return std::malloc(size); }
