// Writes a 32-bit integer with the locale's digits, minus sign and grouping.
#include "format/numfam.h"

VL_TRACE_MODULE("vlltos");

int32_t VLLongToString(VLLocale *locale, int32_t value, char *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLLongToString");
  VL_RET(vl::num::longToString<vl::num::Form::Plain>(locale, value, buffer, 0, size, options));
}
