// A new streaming conversion between two locales' code pages.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvopn");

VLConversion *VLOpenConversion(VLLocale *target, VLLocale *source) {
  VL_FLOW("VLOpenConversion");
  target = vl::orDefault(target);
  source = vl::orDefault(source);
  auto *h = static_cast<VLConversion *>(vl::allocZero(sizeof(VLConversion)));
  if (!h) {
    VL_ERR("VLOpenConversion: no memory for the handle");
    vl::setRc(target, VL_RC_NOMEM);
    VL_RET(h);
  }
  h->source = source;
  h->target = target;
  vl::setRc(target, VL_RC_OK);
  VL_RET(h);
}
