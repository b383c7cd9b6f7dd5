// Appends a locale text item as W values.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrwrdw");

uint32_t VLStrWriteWordW(VLLocale *locale, VLWChar *buffer, int32_t *position, int32_t size, int32_t item,
                         int32_t source) {
  VL_FLOW("VLStrWriteWordW");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(writeWordAt(l, WForm{}, buffer, position, nullptr, size, item, source));
}
