// Reads one token of a number: a digit, a sign, a separator or a run of blanks.
#include "format/numfam.h"

VL_TRACE_MODULE("vlgetdig");

int32_t VLStrGetDigit(VLLocale *locale, char **position, int32_t length, const char *plus, const char *minus,
                      const char *group, const char *decimal, int32_t asciiBased, uint32_t options) {
  VL_FLOW("VLStrGetDigit");
  VL_RET(vl::num::getDigit<vl::num::Form::Plain>(locale, position, nullptr, length, plus, minus, group, decimal,
                                                 asciiBased, options));
}
