// Appends a locale text item in the locale's code page.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrword");

uint32_t VLStrWriteWord(VLLocale *locale, char *buffer, int32_t *position, int32_t size, int32_t item, int32_t source) {
  VL_FLOW("VLStrWriteWord");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(byteForm(l, 0, [&](auto f) { return writeWordAt(l, f, ub(buffer), position, nullptr, size, item, source); }));
}
