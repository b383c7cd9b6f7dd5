// Releases a catalog: its loaded sets, its locale and its file.
#include "catalog/catalog.h"

VL_TRACE_MODULE("vlclscat");

uint32_t VLCloseCatalog(VLCatalog *catalog) {
  VL_FLOW("VLCloseCatalog");
  if (!catalog) VL_RET(uint32_t{VL_RC_CAT_NULL});
  VLFile *file = catalog->file;
  vl::cat::dispose(catalog);
  if (file) VLCloseFile(file, 0);
  VL_RET(uint32_t{0});
}
