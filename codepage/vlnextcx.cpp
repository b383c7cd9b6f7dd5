// Pointer to the next character, passing Shift-Out/Shift-In on either side of it.
#include "codepage/step.h"

VL_TRACE_MODULE("vlnextcx");

char *VLNextCharEx(VLLocale *locale, const char *p, VLShiftState state, VLShiftState *stateOut) {
  VL_FLOW("VLNextCharEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLNextChar(l, p));
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  const unsigned char *q = ub(p);
  if (f.isShift(*q)) f.shift(*q++);
  q += f.len(q);
  if (f.isShift(*q)) f.shift(*q++);
  if (stateOut) *stateOut = f.state;
  VL_RET(cb(q));
}
