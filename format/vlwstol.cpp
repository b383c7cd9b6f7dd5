// Reads a 32-bit integer by the locale's signs and group separator (wide characters, digits of any script).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwstol");

int32_t VLStringToLongW(VLLocale *locale, const VLWChar *string, int32_t length, VLWChar **end, int32_t radix,
                        uint32_t options) {
  VL_FLOW("VLStringToLongW");
  VL_RET(vl::num::stringToLong<vl::num::Form::W>(locale, string, 0, length, end, nullptr, radix, options));
}
