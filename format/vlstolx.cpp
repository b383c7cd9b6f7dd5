// Reads a 32-bit integer by the locale's signs and group separator, from the caller's shift state.
#include "format/numfam.h"

VL_TRACE_MODULE("vlstolx");

int32_t VLStringToLongEx(VLLocale *locale, const char *string, VLShiftState state, int32_t length, char **end,
                         VLShiftState *endState, int32_t radix, uint32_t options) {
  VL_FLOW("VLStringToLongEx");
  VL_RET(vl::num::stringToLong<vl::num::Form::Ex>(locale, string, state, length, end, endState, radix, options));
}
