// Writes a W value in a shift-sensitive page, preceded by the shift byte its size calls
// for. Only the character's bytes are counted: the caller owns the state and moves it.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlputchx");

int32_t VLPutCharEx(VLLocale *locale, char *out, VLShiftState state, VLWChar value) {
  VL_FLOW("VLPutCharEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !out) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLPutChar(l, out, value));
  vl::setRc(l, VL_RC_OK);
  Shifted f = shiftedOf(l, state);
  unsigned char *q = ub(out);
  if (value > 0xFF && !f.state) *q++ = f.so;
  if (value < 0x100 && f.state) *q++ = f.si;
  VL_RET(static_cast<int32_t>(vl::cp::wToMb(q, value)));
}
