// Reads a time by a pattern from W values.
#include "format/timescan.h"

VL_TRACE_MODULE("vlst2tmw");

int32_t VLStringToTimeW(VLLocale *locale, struct tm *time, const VLWChar *input, int32_t inputLength,
                        const VLWChar *pattern, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStringToTimeW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(parse(l, WForm{}, time, input, 0, inputLength, pattern, patternLength, options));
}
