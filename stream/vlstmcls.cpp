// Closes a stream: what waits is flushed and an open double-byte run is closed, so the
// data always ends in the single-byte state.
#include "stream/stream.h"

VL_TRACE_MODULE("vlstmcls");

namespace vl::stm {
int flush(VLStream *s, VLLocale *l);
}

int VLCloseStream(VLStream *stream, VLLocale *locale) {
  VL_FLOW("VLCloseStream");
  using namespace vl::stm;
  VLLocale *l = vl::orDefault(locale);
  if (!stream) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(0);
  }
  vl::setRc(l, VL_RC_OK);
  if (stream->direction == kWrite && stream->transfer) {
    bool ok = !stream->count || flush(stream, l);
    Page pg = pageOf(vl::step::use(locale));
    if (ok && pg.shift && stream->state) {
      uint8_t si = pg.si;
      if (transfer(stream, &si, 1) != 1) vl::setRc(l, VL_RC_STM_FLUSH);
    }
  }
  if (!vl::release(stream) && l && l->lastError == VL_RC_OK) vl::setRc(l, VL_RC_FREEFAIL);
  VL_RET(l ? (l->lastError == VL_RC_OK ? 1 : 0) : 1);
}
