// Sends what a write stream holds back; bytes the transfer function refuses are dropped.
#include "stream/stream.h"

VL_TRACE_MODULE("vlstmflu");

namespace vl::stm {
// Shared with closing, which flushes first.
int flush(VLStream *s, VLLocale *l) {
  setRc(l, VL_RC_OK);
  while (s->direction == kWrite && s->count) {
    int32_t r = transfer(s, s->buffer, s->count);
    if (refused(r, s->count)) {
      s->count = 0;
      setRc(l, VL_RC_STM_FLUSH);
      return 0;
    }
    drop(s, static_cast<uint32_t>(r));
  }
  s->count = 0;
  return 1;
}
}  // namespace vl::stm

int VLFlushStream(VLStream *stream, VLLocale *locale) {
  VL_FLOW("VLFlushStream");
  VLLocale *l = vl::orDefault(locale);
  if (!stream || !stream->transfer) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(0);
  }
  int ok = vl::stm::flush(stream, l);
  if (!ok) VL_ERR("Stream flush refused; buffered bytes discarded");
  VL_RET(ok);
}
