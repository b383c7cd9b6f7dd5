// Pushes back a character given in a shift state; a leading shift byte sets that state.
#include "stream/stream.h"

VL_TRACE_MODULE("vlungcx");

int VLUngetCharEx(VLStream *stream, VLLocale *locale, const char *chr, VLShiftState state) {
  VL_FLOW("VLUngetCharEx");
  using namespace vl::stm;
  VLLocale *l = enterChar(stream, locale, kRead, chr);
  if (!l) VL_RET(0);
  Page pg = pageOf(l);
  auto *c = vl::step::ub(chr);
  if (!pg.shift) VL_RET(unget(stream, l, pg, c, pg.lenOf(*c), -1));
  uint32_t st = state ? 1u : 0u;
  if (pg.isShift(*c)) st = pg.stateOf(*c++);
  VL_RET(unget(stream, l, pg, c, pg.lenIn(st), static_cast<int>(st)));
}
