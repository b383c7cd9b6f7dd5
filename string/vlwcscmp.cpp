// Compares two W strings: exactly or without regard to case.
#include "string/compare.h"

VL_TRACE_MODULE("vlwcscmp");

int32_t VLWcscmp(VLLocale *locale, const VLWChar *str1, int32_t len1, const VLWChar *str2, int32_t len2,
                 uint32_t options) {
  VL_FLOW("VLWcscmp");
  using namespace vl::str;
  // Lengths are always in values; width folding is refused in this form.
  const uint32_t mode = options & ~(kCmpBlanks | VL_OPT_CHARLEN);
  VLLocale *l = cmpLocale(locale, mode != 0 && mode != VL_CMP_NOCASE);
  if (!l) VL_RET(int32_t{0});
  const VLCodePage *c = l->codePage;
  const Keys *keys = mode ? &upperKeys(l) : nullptr;
  const vl::map::CpPage page{c};
  // Values below 256 fold through the single-byte table, which holds what the mapping
  // gives them in every page; special casing maps larger ones as the mapping does.
  auto fold = [c, keys, &page](uint32_t v) -> uint32_t {
    if (v <= 0xFF) return keys->fold[v] & 0xFF;
    return keys->special ? page.upper(v) : VLCpMbCaseConvW(c, v, kFoldMask);
  };
  auto map = [l](VLWChar *out, int32_t cap, const VLWChar *in, uint32_t n, int, uint32_t sel) {
    return VLMapStringW(l, out, cap, in, static_cast<int32_t>(n), sel);
  };
  const VLWChar blank = vl::cp::isAscii(c) ? 0x20 : 0x40;
  VL_RET(compareUnits<VLWChar>(l, str1, len1, str2, len2, (options & kCmpBlanks) != 0, blank, keys,
                               keys ? keys->fold : nullptr, false, fold,
                               map, [&page](const Keys &k, VLWChar v) {
                                 return v <= 0xFF ? k.byte(v) : startsKey(k.sp, page.toUni(v));
                               }));
}
