// Pushes back one UTF-16 unit of a UTF-16 stream.
#include "stream/stream.h"

VL_TRACE_MODULE("vlungcu");

int VLUngetCharU(VLStream *stream, VLLocale *locale, VLUChar unit) {
  VL_FLOW("VLUngetCharU");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kRead, false);
  if (!l) VL_RET(0);
  uint8_t b[2];
  std::memcpy(b, &unit, 2);
  VL_RET(unget(stream, l, Page{}, b, 2, -1));
}
