// Writes a double cut to the locale's precision, with its separators and grouping (wide characters).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwdtos");

int32_t VLDoubleToStringW(VLLocale *locale, double value, VLWChar *buffer, int32_t size, uint32_t options) {
  VL_FLOW("VLDoubleToStringW");
  VL_RET(vl::num::doubleToString<vl::num::Form::W>(locale, value, buffer, 0, size, options));
}
