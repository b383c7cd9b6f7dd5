// Installs a new default locale; the old one is released only once the new one exists.
#include "locale/native.h"

VL_TRACE_MODULE("vlsetlcu");

uint32_t VLSetLocaleU(const VLUChar *name, uint32_t options) {
  VL_FLOW("VLSetLocaleU");
  uint32_t rc = 0;
  VLLocale *l = VLGetLocaleU(name, options, &rc);
  if (!l) VL_RET(rc ? rc : VL_RC_NOMANAGER);
  VLLocale *old = vlglocale;
  vlglocale = l;
  if (old) VLReleaseLocale(old);
  VL_RET(VL_RC_OK);
}
