// Ends a streaming conversion; whatever it still holds is dropped.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvcls");

uint32_t VLCloseConversion(VLConversion *conversion) {
  VL_FLOW("VLCloseConversion");
  if (!vl::release(conversion)) {
    VL_ERR("VLCloseConversion: the free hook refused the handle");
    VL_RET(VL_RC_FREEFAIL);
  }
  VL_RET(VL_RC_OK);
}
