// Reads one token of a number: a digit, a sign, a separator or a run of blanks, with shift states.
#include "format/numfam.h"

VL_TRACE_MODULE("vlgetdgx");

int32_t VLStrGetDigitEx(VLLocale *locale, char **position, VLShiftState *state, int32_t length, const char *plus,
                        const char *minus, const char *group, const char *decimal, int32_t asciiBased,
                        uint32_t options) {
  VL_FLOW("VLStrGetDigitEx");
  VL_RET(vl::num::getDigit<vl::num::Form::Ex>(locale, position, state, length, plus, minus, group, decimal, asciiBased,
                                              options));
}
