// Appends a locale text item in UTF-16.
#include "format/timefam.h"

VL_TRACE_MODULE("vlwrwrdu");

uint32_t VLStrWriteWordU(VLLocale *locale, VLUChar *buffer, int32_t *position, int32_t size, int32_t item,
                         int32_t source) {
  VL_FLOW("VLStrWriteWordU");
  using namespace vl::tf;
  VLLocale *l = usable(locale);
  if (!l) VL_RET(uint32_t{VL_RC_BADARG});
  VL_RET(writeWordAt(l, UForm{}, buffer, position, nullptr, size, item, source));
}
