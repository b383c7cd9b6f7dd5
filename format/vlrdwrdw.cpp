// Reads the longest of a run of locale text items from W values.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdwrdw");

uint32_t VLStrReadWordW(VLLocale *locale, int32_t *index, const VLWChar *input, int32_t *position, int32_t length,
                        int32_t first, int32_t count, int32_t source) {
  VL_FLOW("VLStrReadWordW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(readWordAt(l, WForm{}, index, input, position, nullptr, length, first, count, source));
}
