// Writes a double cut to the locale's precision, with its separators and grouping (UTF-16).
#include "format/numfam.h"

VL_TRACE_MODULE("vldtosu");

int32_t VLDoubleToStringU(VLLocale *locale, double value, VLUChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLDoubleToStringU");
  VL_RET(vl::num::doubleToString<vl::num::Form::U>(locale, value, buffer, 0, size, options));
}
