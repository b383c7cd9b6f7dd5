// Pointer to the previous character in a shift-sensitive page: a shift byte just before
// the pointer tells which state the previous character is in.
#include "codepage/step.h"

VL_TRACE_MODULE("vlprevcx");

char *VLPrevCharEx(VLLocale *locale, const char *start, const char *p, VLShiftState state,
                   VLShiftState *stateOut) {
  VL_FLOW("VLPrevCharEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLPrevChar(l, start, p));
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  if (!start || p <= start) {
    if (stateOut) *stateOut = f.state;
    VL_RET(mut(start ? start : p));
  }
  const unsigned char *q = ub(p), *s = ub(start);
  if (q[-1] == f.si) {
    --q;
    f.state = 1;
  } else if (q[-1] == f.so) {
    --q;
    f.state = 0;
  }
  uint32_t back = f.len(q);
  q = static_cast<uint32_t>(q - s) > back ? q - back : s;
  if (stateOut) *stateOut = f.state;
  VL_RET(cb(q));
}
