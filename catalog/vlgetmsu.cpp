// VLGetMessage into UTF-16, through the caller's code page.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlgetmsu");

uint32_t VLGetMessageU(VLCatalog *catalog, uint32_t set, uint32_t message, VLUChar *buffer, int32_t length,
            const VLUChar *defaultText, uint32_t unused) {
  VL_FLOW("VLGetMessageU");
  VL_RET(vl::cat::getWide(catalog, set, message, buffer, length, defaultText, unused));
}
