// Writes line ends as UTF-16 units.
#include "codepage/step.h"

VL_TRACE_MODULE("vlputeou");

VLUChar *VLPutEolU(VLLocale *locale, VLUChar *out, uint32_t options) {
  VL_FLOW("VLPutEolU");
  using namespace vl::step;
  VLLocale *l = vl::orDefault(locale);
  if (!out) VL_RET(static_cast<VLUChar *>(nullptr));
  uint32_t kinds = eolPutKinds(options);
  if (!kinds) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<VLUChar *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  VL_RET(writeEol(out, kinds, kPutOrderUnits, kEolU));
}
