// Compares two UTF-16 strings: exactly, without regard to case, or to width.
#include "string/compare.h"

VL_TRACE_MODULE("vlstrcmu");

int32_t VLStrcmpU(VLLocale *locale, const VLUChar *str1, int32_t len1, const VLUChar *str2, int32_t len2,
                  uint32_t options) {
  VL_FLOW("VLStrcmpU");
  using namespace vl::str;
  VLLocale *l = cmpLocale(locale, (options & kCmpRejected) != 0);
  if (!l) VL_RET(int32_t{0});
  const Mode mode = modeOf(options);
  auto fold = [mode](uint32_t u) -> uint32_t {
    const VLUChar c = static_cast<VLUChar>(u);
    return mode == Mode::Width ? vl::umap::toHalf(c) : vl::umap::toUpper(c);
  };
  auto map = [l](VLUChar *out, int32_t cap, const VLUChar *in, uint32_t n, int, uint32_t sel) {
    return VLMapStringU(l, out, cap, in, static_cast<int32_t>(n), sel);
  };
  // Width folding has no special table: an empty set of keys stands for it.
  static const Keys kNoKeys;
  const Keys *keys = mode == Mode::Exact ? nullptr : mode == Mode::Case ? &upperKeys(l) : &kNoKeys;
  VL_RET(compareUnits<VLUChar>(l, str1, len1, str2, len2, (options & kCmpBlanks) != 0, VLUChar{0x20}, keys,
                               mode == Mode::Case ? keys->ufold : nullptr, true,
                               fold, map, [](const Keys &k, VLUChar u) { return startsKey(k.sp, u); }));
}
