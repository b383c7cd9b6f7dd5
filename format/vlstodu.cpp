// Reads a double by the locale's separators (UTF-16, digits of any script).
#include "format/numfam.h"

VL_TRACE_MODULE("vlstodu");

double VLStringToDoubleU(VLLocale *locale, const VLUChar *string, int32_t length, VLUChar **end, uint32_t options) {
  VL_FLOW("VLStringToDoubleU");
  VL_RET(vl::num::stringToDouble<vl::num::Form::U>(locale, string, 0, length, end, nullptr, options));
}
