// Pushes back a W value; in a shift-sensitive page its length gives its state.
#include "stream/stream.h"

VL_TRACE_MODULE("vlungcw");

int VLUngetCharW(VLStream *stream, VLLocale *locale, VLWChar value) {
  VL_FLOW("VLUngetCharW");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kRead);
  if (!l) VL_RET(0);
  VL_RET(ungetW(stream, l, pageOf(l), value));
}
