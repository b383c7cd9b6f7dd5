// Opens a stream over the caller's transfer function; the record is the caller's to close.
#include "stream/stream.h"

VL_TRACE_MODULE("vlstmopn");

VLStream *VLOpenStream(VLLocale *locale, VLTransferFn transfer, uint32_t handle, uint32_t mode) {
  VL_FLOW("VLOpenStream");
  VLLocale *l = vl::orDefault(locale);
  if ((mode != VL_STREAM_READ && mode != VL_STREAM_WRITE) || !transfer) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<VLStream *>(nullptr));
  }
  auto *s = static_cast<VLStream *>(vl::allocZero(sizeof(VLStream)));
  if (!s) {
    VL_ERR("Stream record could not be allocated");
    vl::setRc(l, VL_RC_NOMEM);
    VL_RET(s);
  }
  s->transfer = transfer;
  s->handle = handle;
  s->direction = mode == VL_STREAM_WRITE ? vl::stm::kWrite : vl::stm::kRead;
  vl::setRc(l, VL_RC_OK);
  VL_RET(s);
}
