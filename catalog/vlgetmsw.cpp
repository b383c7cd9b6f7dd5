// VLGetMessage into W values, through the caller's code page.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlgetmsw");

uint32_t VLGetMessageW(VLCatalog *catalog, uint32_t set, uint32_t message, VLWChar *buffer, int32_t length,
            const VLWChar *defaultText, uint32_t unused) {
  VL_FLOW("VLGetMessageW");
  VL_RET(vl::cat::getWide(catalog, set, message, buffer, length, defaultText, unused));
}
