// Finds the first line end in a UTF-16 string.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteou");

VLUChar *VLGetEolU(VLLocale *locale, const VLUChar *s, int32_t length, uint32_t *kind, int32_t *eolLength,
                   uint32_t options) {
  VL_FLOW("VLGetEolU");
  using namespace vl::step;
  VLLocale *l = vl::orDefault(locale);
  uint32_t kinds = eolSearchKinds(options & ~VL_OPT_CHARLEN);  // a unit is a character
  if (!kinds) {
    eolRefused(l, kind, eolLength);
    VL_RET(static_cast<VLUChar *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  uint32_t n = s ? resolveLen(s, length) : 0;
  VL_RET(mut(findEol(UForm{}, s, n, kinds, kEolU, kind, eolLength)));
}
