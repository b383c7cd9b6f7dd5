// Swaps the territory of a live handle, all or nothing.
#include "locale/locale.h"

VL_TRACE_MODULE("vlchgter");

uint32_t VLLocaleChangeTerritory(VLLocale *locale, VLObjEntry *territory) {
  VL_FLOW("VLLocaleChangeTerritory");
  VLLocale *l = vl::orDefault(locale);
  if (!l || !territory || territory->type != VL_OBJ_TERRITORY || !vl::loc::body(territory))
    VL_RET(vl::setRc(l, VL_RC_BADARG));
  VLLocale before = *l;
  l->territory = territory;
  uint32_t rc = vl::loc::deriveModifiable(l);
  if (rc) {
    VLLocaleFreeOldText(&before, l);
    *l = before;
  } else {
    VLLocaleFreeOldText(l, &before);
  }
  VL_RET(vl::setRc(l, rc));
}
