// Values of a W string before its 0.
#include "codepage/step.h"

int32_t VLWcslen(VLLocale *locale, const VLWChar *str, uint32_t) {
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  return str ? static_cast<int32_t>(vl::step::length(str)) : 0;
}
