// Appends a fixed-width number as W values.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrnumw");

uint32_t VLStrWriteNumberW(VLLocale *locale, VLWChar *buffer, int32_t *position, int32_t size, int32_t value,
                           int32_t width, int ascii, int modifier) {
  VL_FLOW("VLStrWriteNumberW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(writeNumberAt(l, WForm{}, buffer, position, nullptr, size, value, width, ascii != 0, modifier != 0));
}
