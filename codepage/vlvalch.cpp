// How many bytes of the character at a pointer are there before a 0 byte; the
// character is complete when that equals its length.
#include "codepage/step.h"

VL_TRACE_MODULE("vlvalch");

int32_t VLValidChar(VLLocale *locale, const char *p) {
  VL_FLOW("VLValidChar");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  uint32_t len = bytesOf(l).len(ub(p)), n = 0;
  while (n < len && p[n]) ++n;
  VL_RET(static_cast<int32_t>(n));
}
