// VLValidChar with the character length taken from the shift state.
#include "codepage/step.h"

VL_TRACE_MODULE("vlvalchx");

int32_t VLValidCharEx(VLLocale *locale, const char *p, VLShiftState state) {
  VL_FLOW("VLValidCharEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(int32_t{0});
  if (!isShifted(l)) VL_RET(VLValidChar(l, p));
  vl::setRc(l, VL_RC_OK);
  uint32_t len = shiftedOf(l, state).len(ub(p)), n = 0;
  while (n < len && p[n]) ++n;
  VL_RET(static_cast<int32_t>(n));
}
