// Pushes a character back in front of what the stream holds.
#include "stream/stream.h"

VL_TRACE_MODULE("vlungch");

int VLUngetChar(VLStream *stream, VLLocale *locale, const char *chr) {
  VL_FLOW("VLUngetChar");
  using namespace vl::stm;
  VLLocale *l = enterChar(stream, locale, kRead, chr);
  if (!l) VL_RET(0);
  Page pg = pageOf(l);
  auto *c = vl::step::ub(chr);
  VL_RET(unget(stream, l, pg, c, pg.lenOf(*c), -1));
}
