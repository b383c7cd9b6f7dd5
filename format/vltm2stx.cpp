// Writes a time by a pattern in a shift-sensitive page: buffer and pattern may begin in
// the double-byte state.
#include "format/timefam.h"

VL_TRACE_MODULE("vltm2stx");

int32_t VLTimeToStringEx(VLLocale *locale, const struct tm *time, char *buffer, VLShiftState state, int32_t size,
                         const char *pattern, VLShiftState patternState, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLTimeToStringEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  if (!isShifted(l)) VL_RET(VLTimeToString(l, time, buffer, size, pattern, patternLength, options));
  VL_RET(format(l, shiftedOf(l, patternState), time, ub(buffer), state ? 1u : 0u, size, ub(pattern), patternLength,
                options));
}
