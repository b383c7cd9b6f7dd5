// W values of one locale's code page to W values of another's, one for one.
#include "codepage/convert.h"

VL_TRACE_MODULE("vlcnvstw");

int32_t VLConvertStringW(VLLocale *target, VLWChar *out, int32_t outCount, VLLocale *source, const VLWChar *in,
                         int32_t inCount, uint32_t options) {
  VL_FLOW("VLConvertStringW");
  using namespace vl::cnv;
  target = vl::orDefault(target);
  source = vl::orDefault(source);
  if (!wOptions(options) || !usable(source) || badArgs(target, outCount, out, inCount, in)) {
    VL_ERR("VLConvertStringW: rejected options 0x%x or arguments", options);
    vl::setRc(target, VL_RC_BADARG);
    VL_RET(-1);
  }
  size_t values = inCount < 0 ? strLen(in) : static_cast<size_t>(inCount);
  Shape sh{outCount, (options & VL_OPT_NULLTERM) != 0, false, inCount < 0, inCount == 0, 1};
  WReader<WUni> r(source->codePage, in, values);
  int32_t n = drive(
      r,
      [&](size_t room, auto &&body) {
        WWriter<UniW> w(target->codePage, out, room);
        return body(w);
      },
      sh, target->codePage);
  vl::setRc(target, VL_RC_OK);
  VL_RET(n);
}
