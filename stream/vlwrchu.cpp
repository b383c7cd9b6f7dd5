// Writes one UTF-16 unit (two bytes in machine order) to a UTF-16 stream.
#include "stream/stream.h"

VL_TRACE_MODULE("vlwrchu");

int VLWriteCharU(VLStream *stream, VLLocale *locale, VLUChar unit) {
  VL_FLOW("VLWriteCharU");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kWrite, false);
  if (!l) VL_RET(0);
  uint8_t b[2];
  std::memcpy(b, &unit, 2);
  VL_RET(written(l, send(stream, b, 2)));
}
