// Maps text of the locale's code page; VL_OPT_CHARLEN counts both lengths in characters.
#include "codepage/mapfam.h"

VL_TRACE_MODULE("vlmapstr");

namespace {
// Mapped bytes per requested character, and the most the work area holds.
constexpr uint32_t kPerChar = 6, kWork = 512;
}  // namespace

int32_t VLMapString(VLLocale *locale, char *out, int32_t outLen, const char *in, int32_t inLen, uint32_t selector) {
  VL_FLOW("VLMapString");
  using namespace vl::map;
  Sel sel;
  if (!accept(locale, selector, &sel)) VL_RET(int32_t{-1});
  if (sel.op == Op::Copy) VL_RET(VLStrcpy(locale, out, outLen, in, inLen, sel.chars ? VL_OPT_CHARLEN : 0));
  VLLocale *l = use(locale);
  if (!l || !out || !in || outLen <= 0) VL_RET(int32_t{0});
  const Bytes f = bytesOf(l);
  const CpPage page{l->codePage};
  if (!sel.chars) VL_RET(mapString(f, page, ByteWriter{ub(out), static_cast<uint32_t>(outLen)}, ub(in), inLen, sel,
                                   l->language));
  if (inLen > 0) inLen = static_cast<int32_t>(unitsOf(f, ub(in), static_cast<uint32_t>(inLen)));
  uint8_t work[kWork];
  const uint64_t room = uint64_t{kPerChar} * static_cast<uint32_t>(outLen);
  const uint32_t mapped = static_cast<uint32_t>(
      mapString(f, page, ByteWriter{work, room < kWork ? static_cast<uint32_t>(room) : kWork}, ub(in), inLen, sel,
                l->language));
  const uint32_t bytes = unitsOf(f, work, static_cast<uint32_t>(outLen), mapped);
  std::memcpy(out, work, bytes);
  VL_RET(static_cast<int32_t>(countChars(f, work, bytes)));
}
