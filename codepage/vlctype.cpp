// Classification of the character at a pointer.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlctype");

uint32_t VLGetCharType(VLLocale *locale, const char *p, uint32_t selector) {
  VL_FLOW("VLGetCharType");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(uint32_t{0});
  const VLCodePage *c = l->codePage;
  uint32_t len = bytesOf(l).len(ub(p));
  uint32_t word = len == 1 ? vl::cp::sbcsType(c, ub(p)[0]) : mbType(c, ub(p), len);
  uint32_t out;
  vl::setRc(l, selectType(word, selector, &out) ? VL_RC_OK : VL_RC_BADARG);
  VL_RET(out);
}
