// Splits off the next token of UTF-16 units; the delimiter after it becomes a 0 unit.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrtou");

VLUChar *VLStrtokU(VLLocale *locale, VLUChar *str, int32_t *len, const VLUChar *delims, int32_t delimLen, VLUChar **next) {
  VL_FLOW("VLStrtokU");
  using namespace vl::str;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(tokenize(UForm{}, UForm{}, str, len, delims, delimLen, next, false, nullptr, nullptr));
}
