// Reads a double by the locale's separators (wide characters, digits of any script).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwstod");

double VLStringToDoubleW(VLLocale *locale, const VLWChar *string, int32_t length, VLWChar **end, uint32_t options) {
  VL_FLOW("VLStringToDoubleW");
  VL_RET(vl::num::stringToDouble<vl::num::Form::W>(locale, string, 0, length, end, nullptr, options));
}
