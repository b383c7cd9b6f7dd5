// Writes a W value as its bytes.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlputch");

int32_t VLPutChar(VLLocale *locale, char *out, VLWChar value) {
  VL_FLOW("VLPutChar");
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
  if (!out) VL_RET(int32_t{0});
  VL_RET(static_cast<int32_t>(vl::cp::wToMb(vl::step::ub(out), value)));
}
