// Reads one time directive from UTF-16.
#include "format/timescan.h"

VL_TRACE_MODULE("vlexttmu");

uint32_t VLStrExtractTimeU(VLLocale *locale, struct tm *time, int *afternoon, const VLUChar *input, int32_t *position,
                           int32_t inputLength, const VLUChar *pattern, int32_t *patternPosition, int32_t patternLength,
                           uint32_t options) {
  VL_FLOW("VLStrExtractTimeU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(extractAt(l, UForm{}, time, afternoon, input, position, nullptr, inputLength, pattern, patternPosition,
                   patternLength, options));
}
