// Appends a fixed-width number in UTF-16; the digits are always the ASCII ones.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrnumu");

uint32_t VLStrWriteNumberU(VLLocale *locale, VLUChar *buffer, int32_t *position, int32_t size, int32_t value,
                           int32_t width, int /*ascii*/, int modifier) {
  VL_FLOW("VLStrWriteNumberU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(writeNumberAt(l, UForm{}, buffer, position, nullptr, size, value, width, true, modifier != 0));
}
