// Pointer to the next character.
#include "codepage/step.h"

VL_TRACE_MODULE("vlnextch");

char *VLNextChar(VLLocale *locale, const char *p) {
  VL_FLOW("VLNextChar");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(static_cast<char *>(nullptr));
  vl::setRc(l, VL_RC_OK);
  VL_RET(cb(ub(p) + bytesOf(l).len(ub(p))));
}
