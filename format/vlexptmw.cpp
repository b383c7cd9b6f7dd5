// Expands one time directive into W values.
#include "format/timefam.h"

VL_TRACE_MODULE("vlexptmw");

uint32_t VLStrExpandTimeW(VLLocale *locale, const struct tm *time, VLWChar *buffer, int32_t *position, int32_t size,
                          const VLWChar *pattern, int32_t *patternPosition, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStrExpandTimeW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(expandAt(l, WForm{}, time, buffer, position, nullptr, size, pattern, patternPosition, patternLength, options));
}
