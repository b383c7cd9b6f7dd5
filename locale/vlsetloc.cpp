// Installs a new default locale; the old one is released only once the new one exists.
#include "locale/native.h"

VL_TRACE_MODULE("vlsetloc");

uint32_t VLSetLocale(const char *name, uint32_t options) {
  VL_FLOW("VLSetLocale");
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name, options, &rc);
  if (!l) VL_RET(rc ? rc : VL_RC_NOMANAGER);
  VLLocale *old = vlglocale;
  vlglocale = l;
  if (old) VLReleaseLocale(old);
  VL_RET(VL_RC_OK);
}
