#include "locale/getloc.h"

VLLocale *VLGetLocaleU(const VLUChar *name, uint32_t options, uint32_t *rc) { return vl::loc::getLocale(name, options, rc); }
