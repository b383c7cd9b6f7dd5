// Reads one time directive from text in the locale's code page.
#include "format/timescan.h"

VL_TRACE_MODULE("vlexttm");

uint32_t VLStrExtractTime(VLLocale *locale, struct tm *time, int *afternoon, const char *input, int32_t *position,
                          int32_t inputLength, const char *pattern, int32_t *patternPosition, int32_t patternLength,
                          uint32_t options) {
  VL_FLOW("VLStrExtractTime");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(byteForm(l, 0, [&](auto f) {
    return extractAt(l, f, time, afternoon, ub(input), position, nullptr, inputLength, ub(pattern), patternPosition,
                     patternLength, options);
  }));
}
