// The most target bytes one source character can need.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvrat");

int32_t VLConversionRatio(VLLocale *target, VLLocale *source) {
  VL_FLOW("VLConversionRatio");
  target = vl::orDefault(target);
  source = vl::orDefault(source);
  if (!vl::cnv::usable(target) || !vl::cnv::usable(source)) {
    vl::setRc(target, VL_RC_BADARG);
    VL_RET(1);
  }
  vl::setRc(target, VL_RC_OK);
  const VLCodePage *t = target->codePage;
  if (t->id == source->codePage->id) VL_RET(1);
  VL_RET(static_cast<int32_t>(vl::cp::maxLen(t) + (vl::cp::isShift(t) ? 1 : 0)));
}
