// Byte length of the character at a pointer.
#include "codepage/step.h"

VL_TRACE_MODULE("vlbytlen");

int32_t VLByteLength(VLLocale *locale, const char *p) {
  VL_FLOW("VLByteLength");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(static_cast<int32_t>(bytesOf(l).len(ub(p))));
}
