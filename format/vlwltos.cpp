// Writes a 32-bit integer with the locale's digits, minus sign and grouping (wide characters).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwltos");

int32_t VLLongToStringW(VLLocale *locale, int32_t value, VLWChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLLongToStringW");
  VL_RET(vl::num::longToString<vl::num::Form::W>(locale, value, buffer, 0, size, options));
}
