// Writes a W value; in a shift-sensitive page a value of more than one byte is double-byte.
#include "stream/stream.h"

VL_TRACE_MODULE("vlwrchw");

int VLWriteCharW(VLStream *stream, VLLocale *locale, VLWChar value) {
  VL_FLOW("VLWriteCharW");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kWrite);
  if (!l) VL_RET(0);
  Page pg = pageOf(l);
  uint8_t b[4];
  uint32_t n = static_cast<uint32_t>(vl::cp::wToMb(b, value));
  if (!pg.shift) VL_RET(written(l, send(stream, b, n)));
  if (n > 1 && n != pg.dbl) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(0);
  }
  VL_RET(writeShifted(stream, l, pg, b, n > 1));
}
