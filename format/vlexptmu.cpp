// Expands one time directive into UTF-16.
#include "format/timefam.h"

VL_TRACE_MODULE("vlexptmu");

uint32_t VLStrExpandTimeU(VLLocale *locale, const struct tm *time, VLUChar *buffer, int32_t *position, int32_t size,
                          const VLUChar *pattern, int32_t *patternPosition, int32_t patternLength, uint32_t options) {
  VL_FLOW("VLStrExpandTimeU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(expandAt(l, UForm{}, time, buffer, position, nullptr, size, pattern, patternPosition, patternLength, options));
}
