// The character at a pointer as a W value.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlgetch");

VLWChar VLGetChar(VLLocale *locale, const char *p) {
  VL_FLOW("VLGetChar");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(VLWChar{0});
  vl::setRc(l, VL_RC_OK);
  VL_RET(vl::cp::readW(ub(p), bytesOf(l).len(ub(p))));
}
