// Sets a numeric information item, or swaps an object of the locale by id.
#include "store/store.h"
#include "locale/info.h"

VL_TRACE_MODULE("vlsetnum");

namespace {

uint32_t setNum(VLLocale *l, int32_t item, uint16_t v) {
  namespace loc = vl::loc;
  switch (item) {
    case 1: case 5: case 9: case 11: {
      int type = vl::info::objectType(item);
      if (type == VL_OBJ_SORT && v == 0) return vl::info::applyObject(l, type, nullptr);
      uint32_t rc = 0;
      VLObjEntry *e = vl::store::objById(vlglobals ? vlglobals->objManager : nullptr, static_cast<uint16_t>(type), v, 0, &rc);
      return e ? vl::info::applyObject(l, type, e) : vl::info::lookupRc(rc);
    }
    case 63: case 69: case 70: {
      int i = item == 63 ? 0 : item - 68;
      l->num[i] = v;
      l->setMask |= loc::kMaskNum0 << i;
      return VL_RC_OK;
    }
    case 73: case 74: case 75: case 76: case 82: case 83: {
      if (v > 1) return VL_RC_NOTFOUND;
      int i = item <= 76 ? item - 73 : item - 78;
      uint16_t bit = static_cast<uint16_t>(1u << i);
      l->flags = static_cast<uint16_t>(v ? l->flags | bit : l->flags & ~bit);
      l->setMask |= loc::kMaskFlag0 << i;
      return VL_RC_OK;
    }
    case 77: case 78:
      l->chars[item - 77] = static_cast<uint8_t>(v);
      l->setMask |= loc::kMaskSignPos << (item - 77);
      return VL_RC_OK;
    default:
      return VL_RC_BADITEM;
  }
}

}  // namespace

int VLSetLocaleNumInfo(VLLocale *locale, int32_t item, int32_t value, uint32_t) {
  VL_FLOW("VLSetLocaleNumInfo");
  VLLocale *l = vl::info::target(locale);
  if (!l) VL_RET(0);
  VL_DETAIL("type = %d, value = %d", static_cast<int>(item), static_cast<int>(value));
  uint32_t rc = setNum(l, item, static_cast<uint16_t>(value));
  vl::setRc(l, rc);
  VL_RET(rc == VL_RC_OK ? 1 : 0);
}
