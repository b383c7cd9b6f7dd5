// Fills a catalog block with zeros.
#include "catalog/catalog.h"

void *VLMcSetZero(void *block, size_t size) { return block ? std::memset(block, 0, size) : block; }
