// The whole locale name: language_territory.codepage@sort.
#include "locale/info.h"

VL_TRACE_MODULE("vlgetlst");

char *VLLocaleGetLocaleString(VLLocale *locale, char *buffer) {
  VL_FLOW("VLLocaleGetLocaleString");
  VLLocale *l = vl::info::target(locale);
  if (!l || !buffer) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(static_cast<char *>(nullptr));
  }
  vl::info::localeString(l, buffer);
  vl::setRc(l, VL_RC_OK);
  VL_RET(buffer);
}
