// Classification of the character at a pointer in a shift-sensitive page.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlctypex");

uint32_t VLGetCharTypeEx(VLLocale *locale, const char *p, VLShiftState state, uint32_t selector) {
  VL_FLOW("VLGetCharTypeEx");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l || !p) VL_RET(uint32_t{0});
  if (!isShifted(l)) VL_RET(VLGetCharType(l, p, selector));
  const VLCodePage *c = l->codePage;
  Shifted f = shiftedOf(l, state);
  const unsigned char *q = ub(p);
  if (f.isShift(*q)) f.shift(*q++);
  uint32_t word = f.state ? mbType(c, q, f.dbl) : vl::cp::sbcsType(c, *q);
  uint32_t out;
  vl::setRc(l, selectType(word, selector, &out) ? VL_RC_OK : VL_RC_BADARG);
  VL_RET(out);
}
