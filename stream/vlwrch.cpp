// Writes one character; what the transfer function refuses waits for the next write.
#include "stream/stream.h"

VL_TRACE_MODULE("vlwrch");

int VLWriteChar(VLStream *stream, VLLocale *locale, const char *chr) {
  VL_FLOW("VLWriteChar");
  using namespace vl::stm;
  VLLocale *l = enterChar(stream, locale, kWrite, chr);
  if (!l) VL_RET(0);
  auto *c = vl::step::ub(chr);
  VL_RET(written(l, send(stream, c, pageOf(l).lenOf(*c))));
}
