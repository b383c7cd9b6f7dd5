// Reads one token of a number: a digit, a sign, a separator or a run of blanks (wide characters).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwgetdg");

int32_t VLStrGetDigitW(VLLocale *locale, VLWChar **position, int32_t length, const VLWChar *plus, const VLWChar *minus,
                       const VLWChar *group, const VLWChar *decimal, int32_t asciiBased, uint32_t options) {
  VL_FLOW("VLStrGetDigitW");
  VL_RET(vl::num::getDigit<vl::num::Form::W>(locale, position, nullptr, length, plus, minus, group, decimal, asciiBased,
                                             options));
}
