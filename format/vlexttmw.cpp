// Reads one time directive from W values.
#include "format/timescan.h"

VL_TRACE_MODULE("vlexttmw");

uint32_t VLStrExtractTimeW(VLLocale *locale, struct tm *time, int *afternoon, const VLWChar *input, int32_t *position,
                           int32_t inputLength, const VLWChar *pattern, int32_t *patternPosition, int32_t patternLength,
                           uint32_t options) {
  VL_FLOW("VLStrExtractTimeW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(extractAt(l, WForm{}, time, afternoon, input, position, nullptr, inputLength, pattern, patternPosition,
                   patternLength, options));
}
