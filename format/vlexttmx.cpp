// Reads one time directive, following the input's shift state in *state.
#include "format/timescan.h"

VL_TRACE_MODULE("vlexttmx");

uint32_t VLStrExtractTimeEx(VLLocale *locale, struct tm *time, int *afternoon, const char *input, int32_t *position,
                            VLShiftState *state, int32_t inputLength, const char *pattern, int32_t *patternPosition,
                            int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStrExtractTimeEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(isShifted(l) ? extractAt(l, shiftedOf(l, 0), time, afternoon, ub(input), position, state, inputLength,
                                  ub(pattern), patternPosition, patternLength, options)
                      : VLStrExtractTime(l, time, afternoon, input, position, inputLength, pattern, patternPosition,
                                         patternLength, options));
}
