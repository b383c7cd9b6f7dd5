// Appends a fixed-width number in the locale's code page.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrnum");

uint32_t VLStrWriteNumber(VLLocale *locale, char *buffer, int32_t *position, int32_t size, int32_t value, int32_t width,
                          int ascii, int modifier) {
  VL_FLOW("VLStrWriteNumber");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(byteForm(l, 0, [&](auto f) {
    return writeNumberAt(l, f, ub(buffer), position, nullptr, size, value, width, ascii != 0, modifier != 0);
  }));
}
