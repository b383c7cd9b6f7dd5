// A numeric information item: the handle's value or the territory's default.
#include "locale/info.h"

VL_TRACE_MODULE("vlgetnum");

namespace {

int32_t numInfo(const VLLocale *l, int32_t item, bool defaults) {
  namespace loc = vl::loc;
  const VLObjEntry *t = l->territory;
  const uint16_t tf = loc::word(t, loc::kFlagsWord);
  const uint16_t signs = loc::word(t, loc::kSignWord);
  switch (item) {
    case 1: return l->language->id;
    case 5: return t->id;
    case 9: return l->codePage->id;
    case 11: return l->sort ? l->sort->id : 0;
    case 58: return tf & 1;
    case 63: case 69: case 70: {
      int i = item == 63 ? 0 : item - 68;
      return defaults ? loc::word(t, loc::kNumWord + i) : l->num[i];
    }
    case 73: case 74: case 75: case 76: case 82: case 83: {
      // Handle flag bits 0-5; the territory keeps them one bit higher.
      int i = item <= 76 ? item - 73 : item - 78;
      return ((defaults ? tf >> (i + 1) : l->flags >> i) & 1);
    }
    case 77: return defaults ? signs >> 8 : l->chars[0];
    case 78: return defaults ? signs & 0xFF : l->chars[1];
    case 84: return loc::word(t, 9);
    case 85: return vl::cp::maxLen(l->codePage);
    case 86: return vl::cp::isAscii(l->codePage) ? 1 : 0;
    case 87: return (l->flags & VL_LF_SHIFT) ? 1 : 0;
    default: return -1;
  }
}

}  // namespace

int32_t VLGetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t source) {
  VL_FLOW("VLGetLocaleNumInfo");
  VLLocale *l = vl::info::target(locale);
  if (!l) VL_RET(-1);
  if (source != 0 && source != 1) {
    vl::setRc(l, VL_RC_BADARG);
    VL_RET(-1);
  }
  int32_t v = numInfo(l, item, source == 1);
  vl::setRc(l, v < 0 ? VL_RC_BADITEM : VL_RC_OK);
  VL_RET(v);
}
