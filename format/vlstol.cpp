// Reads a 32-bit integer by the locale's signs and group separator.
#include "format/numfam.h"

VL_TRACE_MODULE("vlstol");

int32_t VLStringToLong(VLLocale *locale, const char *string, int32_t length, char **end, int32_t radix,
                       uint32_t options) {
  VL_FLOW("VLStringToLong");
  VL_RET(vl::num::stringToLong<vl::num::Form::Plain>(locale, string, 0, length, end, nullptr, radix, options));
}
