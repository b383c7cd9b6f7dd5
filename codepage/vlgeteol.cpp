// Finds the first line end of the wanted kinds in a string.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteol");

char *VLGetEol(VLLocale *locale, const char *s, int32_t length, uint32_t *kind, int32_t *eolLength,
               uint32_t options) {
  VL_FLOW("VLGetEol");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  Bytes f = bytesOf(l);
  if ((options & VL_OPT_CHARLEN) && length > 0 && s) {
    length = static_cast<int32_t>(unitsOf(f, ub(s), static_cast<uint32_t>(length)));
    options &= ~VL_OPT_CHARLEN;
  }
  uint32_t kinds = eolSearchKinds(options);
  if (!kinds) {
    eolRefused(l, kind, eolLength);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  uint32_t n = s ? resolveLen(ub(s), length) : 0;
  VL_RET(cb(findEol(f, ub(s), n, kinds, eolOf(l->codePage), kind, eolLength)));
}
