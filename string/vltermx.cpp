// Ends a string of a shift-sensitive page: the Shift-In its state needs, then the 0.
#include "codepage/step.h"

VL_TRACE_MODULE("vltermx");

int32_t VLTerminateStringEx(VLLocale *locale, char *end, VLShiftState state, uint32_t options) {
  VL_FLOW("VLTerminateStringEx");
  using namespace vl::step;
  if (options & ~VL_OPT_NULLTERM) {
    vl::setRc(vl::orDefault(locale), VL_RC_BADARG);
    VL_RET(int32_t{-1});
  }
  VLLocale *l = use(locale);
  if (!l || !end) VL_RET(int32_t{0});
  vl::setRc(l, VL_RC_OK);
  int32_t n = 0;
  if (isShifted(l) && state == 1) end[n++] = static_cast<char>(vl::cp::shiftIn(l->codePage));
  if (options) end[n++] = 0;
  VL_RET(n);
}
