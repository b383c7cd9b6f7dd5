// One step of the number reader over the tokens of VLStrGetDigit.
#include "format/numfam.h"

// A step is too small to trace; the record is kept for the module flags.
[[maybe_unused]] VL_TRACE_MODULE("vldblnst");

int32_t VLStrDoubleNextState(int32_t state, int32_t token, double *value, int32_t *sign, int32_t *fractionExponent,
                             int32_t *exponentSign, int32_t *exponent) {
  if (!value || !sign || !fractionExponent || !exponentSign || !exponent) return -1;
  const bool digit = token >= 0 && token <= 9;
  const double d = token;
  // Far past any double's range, and no further: the counters never wrap.
  constexpr int32_t kBound = 100000;
  switch (state) {
    case 0:  // start
      if (digit) return *value = d, 3;
      if (token == VL_TOK_BLANK) return 0;
      if (token == VL_TOK_PLUS) return 1;
      if (token == VL_TOK_MINUS) return *sign = -1, 1;
      return token == VL_TOK_DECIMAL ? 2 : -1;
    case 1:  // after the sign
      if (digit) return *value = *value * 10 + d, 3;
      return token == VL_TOK_DECIMAL ? 2 : -1;
    case 2:  // a decimal separator first
      if (digit) return *fractionExponent = -1, *value = d / 10, 5;
      return -1;
    case 3:  // integer digits
      if (digit) return *value = *value * 10 + d, 3;
      if (token == VL_TOK_GROUP) return 4;
      if (token == VL_TOK_DECIMAL) return *fractionExponent = 0, 5;
      return -1;
    case 4:  // after a group separator
      if (digit) return *value = *value * 10 + d, 3;
      return -1;
    case 5:  // fraction digits; "D" or "E" starts the exponent
      if (digit) {
        if (*fractionExponent > -kBound) --*fractionExponent;
        *value += d * std::pow(10.0, *fractionExponent);
        return 5;
      }
      return token == 13 || token == 14 ? 6 : -1;
    case 6:  // after the exponent letter
      if (digit) return *exponent = token, 8;
      if (token == VL_TOK_PLUS) return 7;
      if (token == VL_TOK_MINUS) return *exponentSign = -1, 7;
      return -1;
    case 7:  // after the exponent's sign
      if (digit) return *exponent = token, 8;
      return -1;
    case 8:  // exponent digits
      if (digit) {
        if (*exponent < kBound) *exponent = *exponent * 10 + token;
        return 8;
      }
      return -1;
    default:
      return -1;
  }
}
