// Splits off the next token in a shift-sensitive page, reporting the states at which
// the token and the rest begin.
#include "string/strfam.h"

VL_TRACE_MODULE("vlstrtox");

char *VLStrtokEx(VLLocale *locale, char *str, VLShiftState strState, int32_t *len, const char *delims,
                 VLShiftState delimState, int32_t delimLen, char **next, VLShiftState *tokenState,
                 VLShiftState *nextState, uint32_t options) {
  VL_FLOW("VLStrtokEx");
  using namespace vl::str;
  if (next) *next = nullptr;
  if (tokenState) *tokenState = strState ? 1 : 0;
  if (nextState) *nextState = 0;
  VLLocale *l = use(locale);
  if (!l) VL_RET(static_cast<char *>(nullptr));
  if (!isShifted(l)) VL_RET(VLStrtok(l, str, len, delims, delimLen, next, options));
  if (options & ~VL_OPT_CHARLEN) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  unsigned char *n = nullptr;
  unsigned char *token = tokenize(shiftedOf(l, strState), shiftedOf(l, delimState), ub(str), len, ub(delims),
                                  delimLen, &n, options != 0, tokenState, nextState);
  if (next) *next = vl::step::cb(n);
  VL_RET(vl::step::cb(token));
}
