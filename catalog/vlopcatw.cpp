// VLOpenCatalog with W strings, taken into the locale's code page first.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlopcatw");

VLCatalog *VLOpenCatalogW(VLLocale *locale, const VLWChar *pathTemplate, const VLWChar *name, uint32_t options) {
  VL_FLOW("VLOpenCatalogW");
  VL_RET(vl::cat::openWide(locale, pathTemplate, name, options));
}
