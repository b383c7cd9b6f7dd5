// A handle for a native locale name: mapped, built, then adjusted from the platform.
#include "locale/native.h"

VL_TRACE_MODULE("vlcnvnat");

VLLocale *VLConvertNativeLocale(const char *native, uint32_t options, uint32_t *rcOut) {
  VL_FLOW("VLConvertNativeLocale");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (options & ~0x5u) {
    *rc = VL_RC_BADARG;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  char name[132];
  VLMapNativeLocale(native, name, sizeof name);
  VLLocale *l = VLGetLocale(name, options & VL_LOCALE_FALLBACK, rc);
  if (l) VLMapNativeInfo(native, l, static_cast<int>(options & 1));
  VL_RET(l);
}
