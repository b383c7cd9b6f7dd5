// Reads a double by the locale's separators, from the caller's shift state.
#include "format/numfam.h"

VL_TRACE_MODULE("vlstodx");

double VLStringToDoubleEx(VLLocale *locale, const char *string, VLShiftState state, int32_t length, char **end,
                          uint32_t options, VLShiftState *endState) {
  VL_FLOW("VLStringToDoubleEx");
  VL_RET(vl::num::stringToDouble<vl::num::Form::Ex>(locale, string, state, length, end, endState, options));
}
