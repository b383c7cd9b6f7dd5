// Number of whole characters in a byte length.
#include "codepage/step.h"

VL_TRACE_MODULE("vlnumch");

int32_t VLNumChars(VLLocale *locale, const char *s, int32_t length) {
  VL_FLOW("VLNumChars");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !s) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(static_cast<int32_t>(countChars(bytesOf(l), ub(s), resolveLen(ub(s), length))));
}
