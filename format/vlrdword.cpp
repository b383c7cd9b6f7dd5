// Reads the longest of a run of locale text items from text in the locale's code page.
#include "format/timescan.h"

VL_TRACE_MODULE("vlrdword");

uint32_t VLStrReadWord(VLLocale *locale, int32_t *index, const char *input, int32_t *position, int32_t length,
                       int32_t first, int32_t count, int32_t source) {
  VL_FLOW("VLStrReadWord");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(byteForm(l, 0, [&](auto f) {
    return readWordAt(l, f, index, ub(input), position, nullptr, length, first, count, source);
  }));
}
