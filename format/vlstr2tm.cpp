// Reads a time by a pattern from text in the locale's code page.
#include "format/timescan.h"

VL_TRACE_MODULE("vlstr2tm");

int32_t VLStringToTime(VLLocale *locale, struct tm *time, const char *input, int32_t inputLength, const char *pattern,
                       int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStringToTime");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(byteForm(
      l, 0, [&](auto f) { return parse(l, f, time, ub(input), 0, inputLength, ub(pattern), patternLength, options); }));
}
