// Reads the next size of a grouping text (UTF-16).
#include "format/numfam.h"

VL_TRACE_MODULE("vlgrpszu");

int32_t VLStrGroupingSizeU(VLLocale *locale, const VLUChar *grouping, int32_t *remaining, VLUChar **next) {
  VL_FLOW("VLStrGroupingSizeU");
  VLLocale *l = vl::step::use(locale);
  if (!l) VL_RET(int32_t{-1});
  vl::setRc(l, VL_RC_OK);
  VL_RET(vl::num::groupingSize(true, grouping, remaining, next));
}
