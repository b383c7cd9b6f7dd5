// The character at a pointer as a W value, its length given by the shift state.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlgetchx");

VLWChar VLGetCharEx(VLLocale *locale, const char *p, VLShiftState state) {
  VL_FLOW("VLGetCharEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(VLWChar{0});
  if (!isShifted(l)) VL_RET(VLGetChar(l, p));
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  const unsigned char *q = ub(p);
  if (f.isShift(*q)) f.shift(*q++);
  VL_RET(vl::cp::readW(q, f.len(q)));
}
