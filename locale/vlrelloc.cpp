#include "locale/locale.h"

VL_TRACE_MODULE("vlrelloc");

uint32_t VLReleaseLocale(VLLocale *locale) {
  VL_FLOW("VLReleaseLocale");
  if (!locale) VL_RET(VL_RC_OK);
  bool ok = vl::loc::releaseTexts(locale);
  ok &= vl::release(locale);
  VL_RET(ok ? VL_RC_OK : VL_RC_OPEN);
}
