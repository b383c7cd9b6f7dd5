// Splits off the next token. The caller keeps the position (next, len) between calls;
// the delimiter after the token is overwritten with 0 bytes.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrtok");

char *VLStrtok(VLLocale *locale, char *str, int32_t *len, const char *delims, int32_t delimLen, char **next,
               uint32_t options) {
  VL_FLOW("VLStrtok");
  using namespace vl::str;
  if (next) *next = nullptr;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  Bytes f = bytesOf(l);
  unsigned char *n = nullptr;
  unsigned char *token = tokenize(f, f, ub(str), len, ub(delims), delimLen, &n, options != 0, nullptr, nullptr);
  if (next) *next = vl::step::cb(n);
  VL_RET(vl::step::cb(token));
}
