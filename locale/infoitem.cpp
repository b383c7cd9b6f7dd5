// Where each information item is kept, and the composed locale name.
#include <cstdio>

#include "store/store.h"
#include "locale/info.h"

namespace {

const char kBinary[] = "Binary";
const VLUChar kNoText[1] = {0};

// Name of the object of a type with the id the language names as its default.
const char *defaultName(const VLObjEntry *lang, int type, int word) {
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  uint32_t rc = 0;
  const VLObjEntry *e = vl::store::objById(m, static_cast<uint16_t>(type), vl::loc::word(lang, word), 1, &rc);
  if (e) return e->name;
  return type == VL_OBJ_SORT ? kBinary : nullptr;
}

}  // namespace

const VLCodePage *vl::info::asciiPage() {
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  uint32_t rc = 0;
  return vl::store::objById(m, VL_OBJ_CODEPAGE, VL_CP_ASCII, 0, &rc);
}

bool vl::info::locate(const VLLocale *l, int32_t item, bool current, bool utf16, Item *out) {
  const VLObjEntry *lang = l->language, *terr = l->territory;
  auto name = [&](const char *s) {
    *out = {VL_ITEMKIND_NAME, s, false};
    return s != nullptr;
  };
  auto bodyText = [&](const VLObjEntry *e, int w) {
    *out = {VL_ITEMKIND_UTF16, loc::text(e, w), false};
    return true;
  };
  if (item >= 16 && item <= 55) return bodyText(lang, item - 9);
  switch (item) {
    case 2: return name(lang->name);
    case 3: return bodyText(lang, 5);
    case 4: return bodyText(lang, 6);
    case 6: return name(terr->name);
    case 7: return bodyText(terr, 11);
    case 8: return bodyText(terr, 12);
    case 10: return name(l->codePage->name);
    case 12: return name(l->sort ? l->sort->name : kBinary);
    case 13: return name(defaultName(lang, VL_OBJ_TERRITORY, 0));
    case 14: return name(defaultName(lang, VL_OBJ_CODEPAGE, 1));
    case 15: return name(defaultName(lang, VL_OBJ_SORT, 2));
    case 56: return bodyText(lang, 47);
    case 57: return bodyText(lang, 48);
    case 65: return bodyText(terr, 16);
    default: break;
  }
  if (int i = punctIndex(item); i >= 0) {
    if (!current)
      *out = {VL_ITEMKIND_UTF16, loc::body(terr) + 2 * (loc::kPunctWord + i), true};
    else if (utf16)
      *out = {VL_ITEMKIND_UTF16, &l->wchars[i], true};
    else
      *out = {VL_ITEMKIND_CP, &l->chars[2 + i], true};
    return true;
  }
  if (int i = textIndex(item); i >= 0) {
    if (!current) return bodyText(terr, loc::kTextWord[i]);
    if (utf16)
      *out = {VL_ITEMKIND_UTF16, l->textsU[i] ? l->textsU[i] : kNoText, false};
    else
      *out = {VL_ITEMKIND_CP, l->texts[i] ? l->texts[i] : "", false};
    return true;
  }
  return false;
}

void vl::info::localeString(const VLLocale *l, char *out) {
  std::snprintf(out, VL_LOCALE_STRING_SIZE, "%s_%s.%s@%s", l->language->name, l->territory->name, l->codePage->name,
                l->sort ? l->sort->name : kBinary);
}
