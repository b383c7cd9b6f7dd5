// Classification of a UTF-16 unit from the built-in tables.
#include "codepage/step.h"

VL_TRACE_MODULE("vlctypeu");

uint32_t VLGetCharTypeU(VLLocale *locale, VLUChar unit, uint32_t selector) {
  VL_FLOW("VLGetCharTypeU");
  uint32_t out;
  bool ok = vl::step::selectType(vl::step::unicodeType(unit), selector, &out);
  vl::setRc(vl::orDefault(locale), ok ? VL_RC_OK : VL_RC_BADARG);
  VL_RET(out);
}
