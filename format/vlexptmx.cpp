// Expands one time directive, the output's shift state carried in *state.
#include "format/timefam.h"

VL_TRACE_MODULE("vlexptmx");

uint32_t VLStrExpandTimeEx(VLLocale *locale, const struct tm *time, char *buffer, int32_t *position,
                           VLShiftState *state, int32_t size, const char *pattern, int32_t *patternPosition,
                           int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStrExpandTimeEx");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(isShifted(l)
             ? expandAt(l, shiftedOf(l, 0), time, ub(buffer), position, state, size, ub(pattern), patternPosition,
                        patternLength, options)
             : VLStrExpandTime(l, time, buffer, position, size, pattern, patternPosition, patternLength, options));
}
