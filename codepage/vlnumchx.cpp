// Number of whole characters in a byte length, shift bytes not counted.
#include "codepage/step.h"

VL_TRACE_MODULE("vlnumchx");

int32_t VLNumCharsEx(VLLocale *locale, const char *s, VLShiftState state, int32_t length) {
  VL_FLOW("VLNumCharsEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !s) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLNumChars(l, s, length));
  vl::setRc(l, VL_RC_OK);
  VL_RET(static_cast<int32_t>(countChars(shiftedOf(l, state), ub(s), resolveLen(ub(s), length))));
}
