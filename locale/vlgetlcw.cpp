#include "locale/getloc.h"

VLLocale *VLGetLocaleW(const VLWChar *name, uint32_t options, uint32_t *rc) { return vl::loc::getLocale(name, options, rc); }
