// Writes a time by a pattern of W values.
#include "format/timefam.h"

VL_TRACE_MODULE("vltm2stw");

int32_t VLTimeToStringW(VLLocale *locale, const struct tm *time, VLWChar *buffer, int32_t size, const VLWChar *pattern,
                        int32_t patternLength, uint32_t options) {
  VL_FLOW("VLTimeToStringW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(format(l, WForm{}, time, buffer, 0, size, pattern, patternLength, options));
}
