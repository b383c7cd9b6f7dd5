// Expands one time directive in the locale's code page.
#include "format/timefam.h"

VL_TRACE_MODULE("vlexptm");

uint32_t VLStrExpandTime(VLLocale *locale, const struct tm *time, char *buffer, int32_t *position, int32_t size,
                         const char *pattern, int32_t *patternPosition, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStrExpandTime");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(byteForm(l, 0, [&](auto f) {
    return expandAt(l, f, time, ub(buffer), position, nullptr, size, ub(pattern), patternPosition, patternLength,
                    options);
  }));
}
