// Byte length of the character at a pointer; a shift byte there announces the state of
// the character behind it and is not counted.
#include "codepage/step.h"

VL_TRACE_MODULE("vlbytlnx");

int32_t VLByteLengthEx(VLLocale *locale, const char *p, VLShiftState state) {
  VL_FLOW("VLByteLengthEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLByteLength(l, p));
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  if (f.isShift(ub(p)[0])) f.shift(ub(p)[0]);
  VL_RET(static_cast<int32_t>(f.len(ub(p))));
}
