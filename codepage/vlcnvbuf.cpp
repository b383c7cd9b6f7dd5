// One step of a streaming conversion: converts what the input holds into what the
// output can take, and keeps a cut character or undelivered bytes in the handle.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvbuf");

namespace {

using namespace vl::cnv;

// A character that did not fit: as much as fits now, the rest for the next call.
template <class W>
uint32_t spill(VLConversion *h, W &w, Value v) {
  uint8_t buf[8] = {};
  unsigned n = w.spill(v, buf);
  unsigned now = std::min<size_t>(n, static_cast<size_t>(w.end - w.o));
  std::memcpy(w.o, buf, now);
  w.o += now;
  std::memcpy(h->pendingOut, buf + now, n - now);
  h->pendingOutCount = static_cast<uint8_t>(n - now);
  return VL_RC_CNV_FULL;
}

template <class R>
uint32_t hold(VLConversion *h, R &r) {
  size_t n = static_cast<size_t>(r.end - r.p);
  if (n) std::memcpy(h->pendingIn + h->pendingInCount, r.p, n);  // r.p may be null when n is 0
  h->pendingInCount = static_cast<uint8_t>(h->pendingInCount + n);
  r.p = r.end;
  return VL_RC_CNV_PARTIAL;
}

template <class R, class W>
uint32_t run(VLConversion *h, R &r, W &w) {
  if (h->pendingInCount) {
    // Complete the character begun in an earlier call.
    unsigned held = h->pendingInCount;
    unsigned need = std::max(r.need(h->pendingIn[0]), held);
    if (static_cast<size_t>(r.end - r.p) < need - held) return hold(h, r);
    if (need > held) std::memcpy(h->pendingIn + held, r.p, need - held);
    r.p += need - held;
    h->pendingInCount = 0;
    Value v = r.decode(h->pendingIn, need);
    if (!w.put(v)) return spill(h, w, v);
  }
  size_t chars = 0;
  Value held = 0;
  switch (pump(r, w, chars, kNoLimit, held)) {
    case Stop::Done:
      return VL_RC_OK;
    case Stop::Partial:
      return hold(h, r);
    case Stop::Full:
      break;
  }
  return spill(h, w, held);
}

}  // namespace

uint32_t VLConvertBuffer(VLConversion *h, unsigned char **out, uint32_t *outLeft, const unsigned char **in,
                         uint32_t *inLeft, uint32_t) {
  VL_FLOW("VLConvertBuffer");
  if (!h || !out || !outLeft || !in || !inLeft || (*outLeft && !*out) || (*inLeft && !*in) ||
      h->pendingInCount >= sizeof h->pendingIn || h->pendingOutCount > sizeof h->pendingOut) {
    VL_ERR("VLConvertBuffer: bad arguments");
    VL_RET(VL_RC_BADARG);
  }
  VLLocale *source = vl::orDefault(h->source), *target = vl::orDefault(h->target);
  if (!usable(source) || !usable(target)) VL_RET(VL_RC_BADARG);

  if (h->pendingOutCount) {
    if (!*outLeft) VL_RET(VL_RC_CNV_FULL);
    uint32_t n = std::min<uint32_t>(h->pendingOutCount, *outLeft);
    std::memcpy(*out, h->pendingOut, n);
    *out += n;
    *outLeft -= n;
    h->pendingOutCount = static_cast<uint8_t>(h->pendingOutCount - n);
    std::memmove(h->pendingOut, h->pendingOut + n, h->pendingOutCount);
    if (h->pendingOutCount) VL_RET(VL_RC_CNV_FULL);
  }

  uint32_t rc = withUniReader(source, true, *in, *inLeft, h->sourceState, [&](auto &r) {
    return withByteWriter(target->codePage, true, *out, *outLeft, h->targetState, [&](auto &w) {
      uint32_t c = run(h, r, w);
      *in = r.p;
      *inLeft = static_cast<uint32_t>(r.end - r.p);
      *out = w.o;
      *outLeft = static_cast<uint32_t>(w.end - w.o);
      h->sourceState = r.state;
      h->targetState = w.state;
      return c;
    });
  });
  VL_DETAIL("VLConvertBuffer: rc %u, %u bytes held in, %u out", rc, h->pendingInCount, h->pendingOutCount);
  VL_RET(rc);
}
