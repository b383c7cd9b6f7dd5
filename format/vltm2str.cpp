// Writes a time by a pattern in the locale's code page.
#include "format/timefam.h"

VL_TRACE_MODULE("vltm2str");

int32_t VLTimeToString(VLLocale *locale, const struct tm *time, char *buffer, int32_t size, const char *pattern,
                       int32_t patternLength, uint32_t options) {
  VL_FLOW("VLTimeToString");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(int32_t{-1});
  VL_RET(byteForm(
      l, 0, [&](auto f) { return format(l, f, time, ub(buffer), 0, size, ub(pattern), patternLength, options); }));
}
