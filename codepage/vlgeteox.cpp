// Finds the first line end in a shift-sensitive page, starting in the given state.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteox");

char *VLGetEolEx(VLLocale *locale, const char *s, VLShiftState state, int32_t length, uint32_t *kind,
                 int32_t *eolLength, VLShiftState *stateOut, uint32_t options) {
  VL_FLOW("VLGetEolEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLGetEol(l, s, length, kind, eolLength, options));
  VL_RET(getEolBytes(l, shiftedOf(l, state), s, length, kind, eolLength, options, stateOut));
}
