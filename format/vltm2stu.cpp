// Writes a time by a UTF-16 pattern.
#include "format/timefam.h"

VL_TRACE_MODULE("vltm2stu");

int32_t VLTimeToStringU(VLLocale *locale, const struct tm *time, VLUChar *buffer, int32_t size, const VLUChar *pattern,
                        int32_t patternLength, uint32_t options) {
  VL_FLOW("VLTimeToStringU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(format(l, UForm{}, time, buffer, 0, size, pattern, patternLength, options));
}
