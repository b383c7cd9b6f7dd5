// Reads one UTF-16 unit (two bytes in machine order) from a UTF-16 stream.
#include "stream/stream.h"

VL_TRACE_MODULE("vlrdchu");

VLUChar VLReadCharU(VLStream *stream, VLLocale *locale) {
  VL_FLOW("VLReadCharU");
  using namespace vl::stm;
  VLLocale *l = enter(stream, locale, kRead, false);
  if (!l) VL_RET(VLUChar{0xFFFF});
  vl::Block<uint8_t> work(size_t{2});
  if (!work) {
    vl::setRc(l, VL_RC_NOMEM);
    VL_RET(VLUChar{0xFFFF});
  }
  VLUChar u;
  if (!readUnit(stream, l, work.get(), &u)) VL_RET(VLUChar{0xFFFF});
  VL_RET(u);
}
