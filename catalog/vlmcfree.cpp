// Returns catalog memory, and the texts MCGetMsg copies in file mode, to the free hook.
#include "catalog/catalog.h"

void VLMcFree(void *block) { vl::release(block); }
