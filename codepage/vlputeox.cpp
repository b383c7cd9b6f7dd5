// Writes line ends in a shift-sensitive page: a double-byte run is closed first, and
// the text goes on in the single-byte state.
#include "codepage/step.h"

VL_TRACE_MODULE("vlputeox");

char *VLPutEolEx(VLLocale *locale, char *out, VLShiftState state, VLShiftState *stateOut, uint32_t options) {
  VL_FLOW("VLPutEolEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !out) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLPutEol(l, out, options));
  uint32_t kinds = eolPutKinds(options);
  if (!kinds) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  unsigned char *q = ub(out);
  if (state) *q++ = vl::cp::shiftIn(l->codePage);
  if (stateOut) *stateOut = 0;
  VL_RET(cb(writeEol(q, kinds, kPutOrderBytes, eolOf(l->codePage))));
}
