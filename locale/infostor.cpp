// The path every text setter ends in: object names, punctuation characters and texts.
// Nothing in the handle changes until everything the change needs is in hand.
#include <algorithm>

#include "locale/info.h"

namespace {

namespace info = vl::info;
namespace cp = vl::cp;

// Item 2, 6, 10 or 12: at most 32 bytes, mapped into ASCII when the page is EBCDIC-based.
uint32_t setName(VLLocale *l, int32_t item, const uint8_t *s, size_t n) {
  n = strnlen(reinterpret_cast<const char *>(s), std::min(n, info::kNameMax));
  char name[info::kNameMax + 1];
  const VLCodePage *c = l->codePage;
  if (cp::isAscii(c)) {
    std::memcpy(name, s, n);
  } else {
    const VLCodePage *ascii = info::asciiPage();
    for (size_t i = 0; i < n; ++i) {
      if (!info::singleByte(l, s[i])) return VL_RC_NOTFOUND;
      VLUChar u = cp::sbcsUni(c, s[i]);
      uint8_t b[4] = {0xFF};
      if (ascii)
        VLCpUnicodeToChar(ascii, u, b);
      else if (u < 0x80)
        b[0] = static_cast<uint8_t>(u);
      name[i] = static_cast<char>(b[0]);
    }
  }
  name[n] = 0;
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  int type = info::objectType(item);
  uint32_t rc = 0;
  VLObjEntry *e = VLGetObjFromName(m, static_cast<uint16_t>(type), name, static_cast<int32_t>(n), 0, &rc);
  if (!e && type == VL_OBJ_CODEPAGE && rc == VL_RC_NOTFOUND) {
    // A code page may also be named by an alias.
    if (const char *canonical = VLGetCodepageFromAlias(m, name)) {
      rc = 0;
      e = VLGetObjFromName(m, VL_OBJ_CODEPAGE, canonical, static_cast<int32_t>(std::strlen(canonical)), 0, &rc);
    }
  }
  // "Binary" names no sort object, without error.
  if (!e && !(type == VL_OBJ_SORT && rc == 0)) return info::lookupRc(rc);
  return info::applyObject(l, type, e);
}

// Items 59, 60, 61, 66, 67: the first byte, which must be a character by itself.
uint32_t setPunct(VLLocale *l, int i, const uint8_t *s, size_t n) {
  const VLCodePage *c = l->codePage;
  uint8_t b = n ? s[0] : 0;
  if (!info::singleByte(l, b)) return VL_RC_NOTFOUND;
  if (i != 2) {
    // Decimal and group separators, plain and monetary, pair up: 0 with 1, 3 with 4.
    int other = i == 0 ? 1 : i == 1 ? 0 : i == 3 ? 4 : 3;
    if (info::isDigitByte(c, b) || b == l->chars[2 + other]) return VL_RC_NOTFOUND;
    if ((i == 0 || i == 3) && b == 0) return VL_RC_NOTFOUND;
  }
  l->chars[2 + i] = b;
  l->wchars[i] = cp::sbcsUni(c, b);
  l->setMask |= vl::loc::kMaskPunct0 << i;
  l->setMaskU = static_cast<uint16_t>(l->setMaskU | (info::kMaskUPunct0 << i));
  return VL_RC_OK;
}

// The eight texts: the code-page copy and the UTF-16 copy, each grown only when needed.
uint32_t setString(VLLocale *l, int i, const uint8_t *s, size_t n) {
  n = strnlen(reinterpret_cast<const char *>(s), n);
  if (n > 0x7FFFFFF0u) return VL_RC_BADARG;
  if (!(l->flags & VL_LF_SINGLEBYTE)) {
    // Cut back to the last whole character.
    info::Walker w(l, s, n);
    info::Piece p;
    while (w.next(&p)) {
    }
    n = w.i;
  }
  size_t oldLen = l->texts[i] ? std::strlen(l->texts[i]) : 0;
  vl::Block<char> text(!l->texts[i] || n > oldLen ? static_cast<char *>(vl::alloc(n + 1)) : nullptr);
  if ((!l->texts[i] || n > oldLen) && !text) return VL_RC_NOMEM;
  vl::Block<VLUChar> units(static_cast<VLUChar *>(vl::alloc((n + 1) * sizeof(VLUChar))));
  if (!units) return VL_RC_NOMEM;
  int32_t k = n ? VLCpStrToUnicode(l->codePage, s, static_cast<int32_t>(n), units.get()) : 0;
  size_t count = k < 0 ? 0 : std::min(static_cast<size_t>(k), n);
  size_t oldUnits = l->textsU[i] ? vl::loc::ulen(l->textsU[i]) : 0;
  bool growU = !l->textsU[i] || count > oldUnits;
  vl::Block<VLUChar> utext(growU ? static_cast<VLUChar *>(vl::alloc((count + 1) * sizeof(VLUChar))) : nullptr);
  if (growU && !utext) return VL_RC_NOMEM;

  // The source may be the handle's own text: copy before the old block goes.
  char *dst = text ? text.get() : l->texts[i];
  std::memmove(dst, s, n);
  dst[n] = 0;
  if (text) {
    vl::release(l->texts[i]);
    l->texts[i] = text.take();
  }
  VLUChar *udst = utext ? utext.get() : l->textsU[i];
  std::memcpy(udst, units.get(), count * sizeof(VLUChar));
  udst[count] = 0;
  if (utext) {
    vl::release(l->textsU[i]);
    l->textsU[i] = utext.take();
  }
  l->setMask |= vl::loc::kMaskText0 << i;
  l->setMaskU = static_cast<uint16_t>(l->setMaskU | (info::kMaskUText0 << i));
  return VL_RC_OK;
}

}  // namespace

uint32_t vl::info::applyObject(VLLocale *l, int type, VLObjEntry *e) {
  switch (type) {
    case VL_OBJ_LANGUAGE:
      l->language = e;
      return VL_RC_OK;
    case VL_OBJ_TERRITORY:
      return VLLocaleChangeTerritory(l, e);
    case VL_OBJ_CODEPAGE:
      return e == l->codePage ? VL_RC_OK : VLLocaleChangeCodePage(l, e);
    default:
      l->sort = e;
      l->flags = static_cast<uint16_t>(e ? l->flags & ~VL_LF_BINARY : l->flags | VL_LF_BINARY);
      return VL_RC_OK;
  }
}

uint32_t vl::info::storeText(Tracer &trc, VLLocale *l, int32_t item, const uint8_t *s, size_t n, int32_t length) {
  if (trc.on(TRC1_DETAIL)) {
    char shown[64];
    size_t k = strnlen(reinterpret_cast<const char *>(s), std::min(n, sizeof shown - 1));
    std::memcpy(shown, s, k);
    shown[k] = 0;
    TRC1_Printf(trc.record(), "type = %d, buffer size = %d, data = %s", static_cast<int>(item), static_cast<int>(length),
                shown);
  }
  if (objectType(item) >= 0 && item % 2 == 0) return setName(l, item, s, n);
  if (int i = punctIndex(item); i >= 0) return setPunct(l, i, s, n);
  if (int i = textIndex(item); i >= 0) return setString(l, i, s, n);
  return VL_RC_BADITEM;
}
