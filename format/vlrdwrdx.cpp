// Reads the longest of a run of locale text items, following the input's shift state in *state.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdwrdx");

uint32_t VLStrReadWordEx(VLLocale *locale, int32_t *index, const char *input, int32_t *position, VLShiftState *state,
                         int32_t length, int32_t first, int32_t count, int32_t source) {
  VL_FLOW("VLStrReadWordEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(isShifted(l) ? readWordAt(l, shiftedOf(l, 0), index, ub(input), position, state, length, first, count, source)
                      : VLStrReadWord(l, index, input, position, length, first, count, source));
}
