// Writes a 32-bit integer with the locale's digits, minus sign and grouping, from the caller's shift state.
#include "format/numfam.h"

VL_TRACE_MODULE("vlltosx");

int32_t VLLongToStringEx(VLLocale *locale, int32_t value, char *buffer, VLShiftState state, int32_t size,
                         uint32_t options) {
  VL_FLOW("VLLongToStringEx");
  VL_RET(vl::num::longToString<vl::num::Form::Ex>(locale, value, buffer, state, size, options));
}
