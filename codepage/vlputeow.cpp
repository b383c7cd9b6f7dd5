// Writes line ends as W values.
#include "codepage/step.h"

VL_TRACE_MODULE("vlputeow");

VLWChar *VLPutEolW(VLLocale *locale, VLWChar *out, uint32_t options) {
  VL_FLOW("VLPutEolW");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !out) VL_RET(static_cast<VLWChar *>(nullptr));
  uint32_t kinds = eolPutKinds(options);
  if (!kinds) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<VLWChar *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  VL_RET(writeEol(out, kinds, kPutOrderUnits, eolOf(l->codePage)));
}
