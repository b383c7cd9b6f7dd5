// Sort key of UTF-16 units.
#include "string/collfam.h"

VL_TRACE_MODULE("vlstrgsk");

int32_t VLStrGenSortKey(VLLocale *locale, unsigned char *dst, int32_t dstLen, const VLUChar *units, int32_t count) {
  VL_FLOW("VLStrGenSortKey");
  using namespace vl::coll;
  VLLocale *l = vl::orDefault(locale);
  if (!l || !usesSort(l) || count < 0 || (count && !units)) VL_RET(int32_t{-1});
  VL_RET(genKey(quickOf(l), dst, dst && dstLen > 0 ? static_cast<uint32_t>(dstLen) : 0, units,
                static_cast<uint32_t>(count)));
}
