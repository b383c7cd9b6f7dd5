// Reads a 32-bit integer by the locale's signs and group separator (UTF-16, digits of any script).
#include "format/numfam.h"

VL_TRACE_MODULE("vlstolu");

int32_t VLStringToLongU(VLLocale *locale, const VLUChar *string, int32_t length, VLUChar **end, int32_t radix,
                        uint32_t options) {
  VL_FLOW("VLStringToLongU");
  VL_RET(vl::num::stringToLong<vl::num::Form::U>(locale, string, 0, length, end, nullptr, radix, options));
}
