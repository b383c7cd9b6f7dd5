// W values to UTF-16, one unit for each.
#include "codepage/convert.h"

VL_TRACE_MODULE("vls2uw");

int32_t VLStringToUnicodeW(VLUChar *out, int32_t outCount, VLLocale *locale, const VLWChar *in, int32_t inCount,
                           uint32_t options) {
  VL_FLOW("VLStringToUnicodeW");
  using namespace vl::cnv;
  locale = vl::orDefault(locale);
  if (!wOptions(options) || badArgs(locale, outCount, out, inCount, in)) {
    VL_ERR("VLStringToUnicodeW: rejected options 0x%x or arguments", options);
    vl::setRc(locale, VL_RC_BADARG);
    VL_RET(-1);
  }
  size_t values = inCount < 0 ? strLen(in) : static_cast<size_t>(inCount);
  Shape sh{outCount, (options & VL_OPT_NULLTERM) != 0, false, inCount < 0, inCount == 0, 1};
  WReader<WUni> r(locale->codePage, in, values);
  int32_t n = drive(
      r,
      [&](size_t room, auto &&body) {
        U16Writer w(out, room);
        return body(w);
      },
      sh, locale->codePage);
  vl::setRc(locale, VL_RC_OK);
  VL_RET(n);
}
