// Writes a 32-bit integer with the locale's digits, minus sign and grouping (UTF-16).
#include "format/numfam.h"

VL_TRACE_MODULE("vlltosu");

int32_t VLLongToStringU(VLLocale *locale, int32_t value, VLUChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLLongToStringU");
  VL_RET(vl::num::longToString<vl::num::Form::U>(locale, value, buffer, 0, size, options));
}
