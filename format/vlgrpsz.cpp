// Reads the next size of a grouping text.
#include "format/numfam.h"

VL_TRACE_MODULE("vlgrpsz");

int32_t VLStrGroupingSize(VLLocale *locale, const char *grouping, int32_t *remaining, char **next) {
  VL_FLOW("VLStrGroupingSize");
  VLLocale *l = vl::step::use(locale);
  if (!l) VL_RET(int32_t{-1});
  vl::setRc(l, VL_RC_OK);
  VL_RET(vl::num::groupingSize(vl::cp::isAscii(l->codePage), grouping, remaining, next));
}
