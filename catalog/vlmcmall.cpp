// Catalog memory comes from the library's allocation hook.
#include "catalog/catalog.h"

void *VLMcMalloc(size_t size) { return vl::alloc(size ? size : 1); }
