// Writes a single- or double-byte character, with the shift byte the stream state needs.
#include "stream/stream.h"

VL_TRACE_MODULE("vlwrchx");

int VLWriteCharEx(VLStream *stream, VLLocale *locale, const char *chr, int doubleByte) {
  VL_FLOW("VLWriteCharEx");
  using namespace vl::stm;
  VLLocale *l = enterChar(stream, locale, kWrite, chr);
  if (!l) VL_RET(0);
  Page pg = pageOf(l);
  auto *c = vl::step::ub(chr);
  if (!pg.shift) VL_RET(written(l, send(stream, c, pg.lenOf(*c))));
  VL_RET(writeShifted(stream, l, pg, c, doubleByte != 0));
}
