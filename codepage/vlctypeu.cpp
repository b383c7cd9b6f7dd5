// Classification of a UTF-16 unit from the built-in tables; the stretches between the
// tables are uniform and carry one word each.
#include "codepage/step.h"

VL_TRACE_MODULE("vlctypeu");

namespace {

uint32_t typeWordU(uint32_t u) {
  if (u <= VL_UNICODE_CTYPE1_LAST) return VL_UNICODE_Ctype1[u];
  if (u < VL_UNICODE_CTYPE2_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE2_LAST) return VL_UNICODE_Ctype2[u - VL_UNICODE_CTYPE2_FIRST];
  if (u < VL_UNICODE_CTYPE3_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE3_LAST) return VL_UNICODE_Ctype3[u - VL_UNICODE_CTYPE3_FIRST];
  if (u < VL_UNICODE_CTYPE4_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE4_LAST) return VL_UNICODE_Ctype4[u - VL_UNICODE_CTYPE4_FIRST];
  if (u < VL_UNICODE_CTYPE5_FIRST) {  // mathematical operators
    if (u == 0x2212 || u == 0x2213) return 0x2008020;
    return u == 0x221E ? 0x200020 : 0x2200020;
  }
  if (u <= VL_UNICODE_CTYPE5_LAST) return VL_UNICODE_Ctype5[u - VL_UNICODE_CTYPE5_FIRST];
  if (u < VL_UNICODE_CTYPE6_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE6_LAST) return VL_UNICODE_Ctype6[u - VL_UNICODE_CTYPE6_FIRST];
  if (u < 0x4E00) return 0x400;
  if (u <= 0x9FA5) return 0x40000801;  // ideographs
  if (u < 0xAC00) return 0x400;
  if (u <= 0xD7A3) return 0x801;  // Hangul syllables
  if (u < 0xF900) return 0x400;
  if (u <= 0xFA2D) return 0x40000801;
  if (u < VL_UNICODE_CTYPE7_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE7_LAST) return VL_UNICODE_Ctype7[u - VL_UNICODE_CTYPE7_FIRST];
  if (u < VL_UNICODE_CTYPE8_FIRST) return u == 0xFBE9 || u == 0xFCE1 ? 0x400 : 0x1001;  // Arabic forms
  return VL_UNICODE_Ctype8[u - VL_UNICODE_CTYPE8_FIRST];
}

}  // namespace

uint32_t VLGetCharTypeU(VLLocale *locale, VLUChar unit, uint32_t selector) {
  VL_FLOW("VLGetCharTypeU");
  uint32_t out;
  bool ok = vl::step::selectType(typeWordU(unit), selector, &out);
  vl::setRc(vl::orDefault(locale), ok ? VL_RC_OK : VL_RC_BADARG);
  VL_RET(out);
}
