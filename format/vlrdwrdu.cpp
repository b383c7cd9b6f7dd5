// Reads the longest of a run of locale text items from UTF-16.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdwrdu");

uint32_t VLStrReadWordU(VLLocale *locale, int32_t *index, const VLUChar *input, int32_t *position, int32_t length,
                        int32_t first, int32_t count, int32_t source) {
  VL_FLOW("VLStrReadWordU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(readWordAt(l, UForm{}, index, input, position, nullptr, length, first, count, source));
}
