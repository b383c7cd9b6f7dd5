// Reads one token of a number: a digit, a sign, a separator or a run of blanks (UTF-16).
#include "format/numfam.h"

VL_TRACE_MODULE("vlgetdgu");

int32_t VLStrGetDigitU(VLLocale *locale, VLUChar **position, int32_t length, const VLUChar *plus, const VLUChar *minus,
                       const VLUChar *group, const VLUChar *decimal, int32_t asciiBased, uint32_t options) {
  VL_FLOW("VLStrGetDigitU");
  VL_RET(vl::num::getDigit<vl::num::Form::U>(locale, position, nullptr, length, plus, minus, group, decimal, asciiBased,
                                             options));
}
