// UTF-16 to W values, one for each unit.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlu2sw");

int32_t VLUnicodeToStringW(VLLocale *locale, VLWChar *out, int32_t outCount, const VLUChar *in, int32_t inLength,
                           uint32_t options) {
  VL_FLOW("VLUnicodeToStringW");
  using namespace vl::cnv;
  locale = vl::orDefault(locale);
  if (!wOptions(options) || badArgs(locale, outCount, out, inLength, in)) {
    VL_ERR("VLUnicodeToStringW: rejected options 0x%x or arguments", options);
    vl::setRc(locale, VL_RC_BADARG);
    VL_RET(-1);
  }
  size_t units = inLength < 0 ? strLen(in) : static_cast<size_t>(inLength);
  Shape sh{outCount, (options & VL_OPT_NULLTERM) != 0, false, inLength < 0, inLength == 0, 1};
  U16Reader r(in, units);
  int32_t n = drive(
      r,
      [&](size_t room, auto &&body) {
        WWriter<UniW> w(locale->codePage, out, room);
        return body(w);
      },
      sh, locale->codePage);
  vl::setRc(locale, VL_RC_OK);
  VL_RET(n);
}
