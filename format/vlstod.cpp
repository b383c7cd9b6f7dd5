// Reads a double by the locale's separators.
#include "format/numfam.h"

VL_TRACE_MODULE("vlstod");

double VLStringToDouble(VLLocale *locale, const char *string, int32_t length, char **end, uint32_t options) {
  VL_FLOW("VLStringToDouble");
  VL_RET(vl::num::stringToDouble<vl::num::Form::Plain>(locale, string, 0, length, end, nullptr, options));
}
