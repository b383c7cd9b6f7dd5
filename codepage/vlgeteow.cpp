// Finds the first line end in a W string; the code page's line-end bytes are compared
// as W values.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteow");

VLWChar *VLGetEolW(VLLocale *locale, const VLWChar *s, int32_t length, uint32_t *kind, int32_t *eolLength,
                   uint32_t options) {
  VL_FLOW("VLGetEolW");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<VLWChar *>(nullptr));
  uint32_t kinds = eolSearchKinds(options & ~VL_OPT_CHARLEN);  // a unit is a character
  if (!kinds) {
    eolRefused(l, kind, eolLength);
    VL_RET(static_cast<VLWChar *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  uint32_t n = s ? resolveLen(s, length) : 0;
  VL_RET(mut(findEol(WForm{}, s, n, kinds, eolOf(l->codePage), kind, eolLength)));
}
