// Reads a time by a pattern in a shift-sensitive page: input and pattern may begin in the
// double-byte state.
#include "format/timescan.h"

VL_TRACE_MODULE("vlst2tmx");

int32_t VLStringToTimeEx(VLLocale *locale, struct tm *time, const char *input, VLShiftState inputState,
                         int32_t inputLength, const char *pattern, VLShiftState patternState, int32_t patternLength,
                         uint32_t options) {
  VL_FLOW("VLStringToTimeEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  if (!isShifted(l)) VL_RET(VLStringToTime(l, time, input, inputLength, pattern, patternLength, options));
  VL_RET(parse(l, shiftedOf(l, patternState), time, ub(input), inputState ? 1u : 0u, inputLength, ub(pattern),
               patternLength, options));
}
