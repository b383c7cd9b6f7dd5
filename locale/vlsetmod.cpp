// Re-derives every value the caller has not set, all or nothing.
#include "locale/locale.h"

uint32_t VLLocaleSetModifiable(VLLocale *locale) {
  VLLocale *l = vl::orDefault(locale);
  if (!l) return VL_RC_BADARG;
  VLLocale before = *l;
  uint32_t rc = vl::loc::deriveModifiable(l);
  if (rc) {
    VLLocaleFreeOldText(&before, l);
    *l = before;
  } else {
    VLLocaleFreeOldText(l, &before);
  }
  return vl::setRc(l, rc);
}
