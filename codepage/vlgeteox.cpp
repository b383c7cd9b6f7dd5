// Finds the first line end in a shift-sensitive page, starting in the given state.
#include "codepage/step.h"

VL_TRACE_MODULE("vlgeteox");

char *VLGetEolEx(VLLocale *locale, const char *s, VLShiftState state, int32_t length, uint32_t *kind,
                 int32_t *eolLength, VLShiftState *stateOut, uint32_t options) {
  VL_FLOW("VLGetEolEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLGetEol(l, s, length, kind, eolLength, options));
  Shifted f = shiftedOf(l, state);
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
  VL_RET(cb(findEol(f, ub(s), n, kinds, eolOf(l->codePage), kind, eolLength, stateOut)));
}
