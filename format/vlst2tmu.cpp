// Reads a time by a UTF-16 pattern.
#include "format/timescan.h"

VL_TRACE_MODULE("vlst2tmu");

int32_t VLStringToTimeU(VLLocale *locale, struct tm *time, const VLUChar *input, int32_t inputLength,
                        const VLUChar *pattern, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStringToTimeU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(parse(l, UForm{}, time, input, 0, inputLength, pattern, patternLength, options));
}
