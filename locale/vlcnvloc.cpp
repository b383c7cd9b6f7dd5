// A handle's locale back to a native name: first the rows keyed by object ids, then the
// native table read in reverse by object name (the first row in table order wins, so
// "de_DE.utf8" is preferred to "de_DE@euro" and "C" to "POSIX").
#include <strings.h>

#include "locale/native.h"

VL_TRACE_MODULE("vlcnvloc");

namespace {

struct IdRow {
  uint16_t language, territory, codePage;
  const char *native;
};
const IdRow kIdRows[] = {
    {1, 840, VL_CP_ASCII, "C"},
};

bool sameName(const VLObjEntry *e, const char *name) {
  return e && strncasecmp(e->name, name, sizeof e->name) == 0;
}

const char *nativeFor(const VLLocale *l) {
  for (const IdRow &r : kIdRows)
    if (l->language->id == r.language && l->territory->id == r.territory && l->codePage->id == r.codePage)
      return r.native;
  for (uint32_t i = 0; i < vl::nat::kRowCount; ++i) {
    const vl::nat::Row &r = vl::nat::kRows[i];
    if (sameName(l->language, r.language) && sameName(l->territory, r.territory) &&
        sameName(l->codePage, r.codePage))
      return r.native;
  }
  return nullptr;
}

}  // namespace

int VLConvertLocale(VLLocale *locale, char *out, int32_t size) {
  VL_FLOW("VLConvertLocale");
  VLLocale *l = vl::orDefault(locale);
  if (!l || !l->language || !l->territory || !l->codePage || !out || size <= 0) VL_RET(0);
  const char *native = nativeFor(l);
  if (!native || std::strlen(native) >= static_cast<size_t>(size)) VL_RET(0);
  std::memcpy(out, native, std::strlen(native) + 1);
  VL_RET(1);
}
