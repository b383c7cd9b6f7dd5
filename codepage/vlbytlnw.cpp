// Byte length of a W value.
#include "codepage/step.h"

VL_TRACE_MODULE("vlbytlnw");

int32_t VLByteLengthW(VLLocale *locale, VLWChar value) {
  VL_FLOW("VLByteLengthW");
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  VL_RET(int32_t{value < 0x100 ? 1 : value < 0x10000 ? 2 : value < 0x1000000 ? 3 : 4});
}
