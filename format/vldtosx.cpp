// Writes a double cut to the locale's precision, with its separators and grouping, from the caller's shift state.
#include "format/numfam.h"

VL_TRACE_MODULE("vldtosx");

int32_t VLDoubleToStringEx(VLLocale *locale, double value, char *buffer, VLShiftState state, int32_t size,
                           uint32_t options) {
  VL_FLOW("VLDoubleToStringEx");
  VL_RET(vl::num::doubleToString<vl::num::Form::Ex>(locale, value, buffer, state, size, options));
}
