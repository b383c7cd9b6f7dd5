// Writes a double cut to the locale's precision, with its separators and grouping.
#include "format/numfam.h"

VL_TRACE_MODULE("vldtos");

int32_t VLDoubleToString(VLLocale *locale, double value, char *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLDoubleToString");
  VL_RET(vl::num::doubleToString<vl::num::Form::Plain>(locale, value, buffer, 0, size, options));
}
