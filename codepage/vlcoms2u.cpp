// ASCII bytes to UTF-16 through the US-ASCII code page object (number 367).
#include <climits>
#include <cstring>

#include "codepage/cpprim.h"

VL_TRACE_MODULE("vlcoms2u");

int32_t VLComStrToUnicode(const unsigned char *s, uint32_t length, VLUChar *out) {
  VL_FLOW("VLComStrToUnicode");
  uint32_t rc = 0;
  const VLCodePage *cp =
      vlglobals ? VLGetObjFromID(vlglobals->objManager, VL_OBJ_CODEPAGE, VL_CP_ASCII, 0, &rc) : nullptr;
  // An empty code page range can answer with an entry of another type.
  if (!vl::cp::usable(cp) || cp->type != VL_OBJ_CODEPAGE || !s || !out) {
    VL_ERR("Code page %d not available, rc = %d", static_cast<int>(VL_CP_ASCII), static_cast<int>(rc));
    VL_RET(int32_t{-1});
  }
  size_t n = length;
  if (length == 0xFFFFFFFFu) {
    n = std::strlen(reinterpret_cast<const char *>(s));
    if (n < 1) VL_RET(int32_t{-1});
  }
  if (n > INT32_MAX) n = INT32_MAX;  // the count must fit the result; a 0 ends it sooner
  size_t i = 0;
  for (; i < n && s[i]; ++i) out[i] = vl::cp::sbcsUni(cp, s[i]);
  out[i] = 0;
  VL_RET(static_cast<int32_t>(i));
}
