// Units of a UTF-16 string before its 0.
#include "codepage/step.h"

int32_t VLStrlenU(VLLocale *locale, const VLUChar *str, uint32_t) {
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  return str ? static_cast<int32_t>(vl::step::length(str)) : 0;
}
