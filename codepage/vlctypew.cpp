// Classification of a W value.
#include "codepage/cpprim.h"
#include "codepage/step.h"

VL_TRACE_MODULE("vlctypew");

uint32_t VLGetCharTypeW(VLLocale *locale, VLWChar value, uint32_t selector) {
  VL_FLOW("VLGetCharTypeW");
  using namespace vl::step;
  VLLocale *l = use(locale);
  if (!l) VL_RET(uint32_t{0});
  const VLCodePage *c = l->codePage;
  uint32_t word = value < 0x100 ? vl::cp::sbcsType(c, static_cast<uint8_t>(value)) : wType(c, value);
  uint32_t out;
  vl::setRc(l, selectType(word, selector, &out) ? VL_RC_OK : VL_RC_BADARG);
  VL_RET(out);
}
