// Reads the next size of a grouping text (wide characters).
#include "format/numfam.h"

VL_TRACE_MODULE("vlwgrpsz");

int32_t VLStrGroupingSizeW(VLLocale *locale, const VLWChar *grouping, int32_t *remaining, VLWChar **next) {
  VL_FLOW("VLStrGroupingSizeW");
  VLLocale *l = vl::step::use(locale);
  if (!l) VL_RET(int32_t{-1});
  vl::setRc(l, VL_RC_OK);
  VL_RET(vl::num::groupingSize(vl::cp::isAscii(l->codePage), grouping, remaining, next));
}
