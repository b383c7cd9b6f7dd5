// Starts a caller's shift state in the single-byte state.
#include "codepage/step.h"

VL_TRACE_MODULE("vlinitst");

void VLInitState(VLLocale *locale, VLShiftState *state) {
  VL_FLOW("VLInitState");
  if (state) *state = 0;
  vl::setRc(vl::orDefault(locale), VL_RC_OK);
}
