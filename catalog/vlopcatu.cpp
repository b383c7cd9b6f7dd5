// VLOpenCatalog with UTF-16 strings, taken into the locale's code page first.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlopcatu");

VLCatalog *VLOpenCatalogU(VLLocale *locale, const VLUChar *pathTemplate, const VLUChar *name, uint32_t options) {
  VL_FLOW("VLOpenCatalogU");
  VL_RET(vl::cat::openWide(locale, pathTemplate, name, options));
}
