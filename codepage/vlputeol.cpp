// Writes the line ends of the option word.
#include "codepage/step.h"

VL_TRACE_MODULE("vlputeol");

char *VLPutEol(VLLocale *locale, char *out, uint32_t options) {
  VL_FLOW("VLPutEol");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !out) VL_RET(static_cast<char *>(nullptr));
  uint32_t kinds = eolPutKinds(options);
  if (!kinds) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  VL_RET(cb(writeEol(ub(out), kinds, kPutOrderBytes, eolOf(l->codePage))));
}
