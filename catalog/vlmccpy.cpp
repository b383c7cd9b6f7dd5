// Copies within catalog memory.
#include "catalog/catalog.h"

void *VLMcMemcpy(void *to, const void *from, size_t size) { return size ? std::memcpy(to, from, size) : to; }
