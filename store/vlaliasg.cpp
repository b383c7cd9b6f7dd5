// Canonical code page name of an alias.
#include "store/store.h"

VL_TRACE_MODULE("vlaliasg");

const char *VLGetCodepageFromAlias(VLObjManager *m, const char *name) {
  VL_FLOW("VLGetCodepageFromAlias");
  if (!m || !name) VL_RET(static_cast<const char *>(nullptr));
  VL_DETAIL("Searching for %s.", name);
  size_t n = std::strlen(name);
  for (const VLAlias *r = m->aliases; r; r = r->next) {
    if (std::strlen(r->alias) == n && VLmemicmp(r->alias, name, n) == 0) {
      VL_DETAIL("%s -> %s", name, r->codePage);
      VL_RET(static_cast<const char *>(r->codePage));
    }
  }
  VL_RET(static_cast<const char *>(nullptr));
}
