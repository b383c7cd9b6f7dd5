// Copies a native locale's numeric and currency conventions into a handle. The platform
// locale is switched for the duration and always put back.
#include <climits>
#include <cstdio>

#include "codepage/cpbody.h"
#include "locale/native.h"

VL_TRACE_MODULE("vlmapinf");

namespace {

// Single-character conventions the platform leaves unset read as CHAR_MAX.
inline bool has(char c) { return c != CHAR_MAX; }

// "3;3;0" for the group sizes 3 and 3; empty when the platform gives no grouping.
void groupingText(const char *g, char *out, size_t size) {
  size_t n = 0;
  out[0] = 0;
  if (!g || !*g) return;
  for (; *g && *g != CHAR_MAX && n + 5 < size; ++g) {
    int w = std::snprintf(out + n, size - n, "%u;", static_cast<unsigned>(static_cast<unsigned char>(*g)));
    if (w < 0) break;
    n += static_cast<size_t>(w);
  }
  std::snprintf(out + n, size - n, "0");
}

// What the handle takes from the platform, copied out before the platform locale returns.
struct Conventions {
  char fracDigits, intFracDigits;
  char pCsPrecedes, pSepBySpace, nCsPrecedes, nSepBySpace, pSignPosn, nSignPosn;
  char grouping[64], monGrouping[64];
  char decimal[8], thousands[8], monDecimal[8], monThousands[8];
  char currency[32], positive[16], negative[16];
  char localeName[132];  // the library name of the native locale
};

void copyField(char *out, size_t size, const char *s) { vl::nat::copyTrunc(out, size, s ? s : ""); }

void setFlag(VLLocale *l, uint16_t bit, char v) {
  if (!has(v)) return;
  if (v)
    l->flags = static_cast<uint16_t>(l->flags | bit);
  else
    l->flags = static_cast<uint16_t>(l->flags & ~bit);
}

// The code page part of a library locale name: between the last "." before "@" and "@".
void codePagePart(const char *name, char *out, size_t size) {
  const char *at = std::strchr(name, '@');
  const char *end = at ? at : name + std::strlen(name);
  const char *dot = nullptr;
  for (const char *p = name; p < end; ++p)
    if (*p == '.') dot = p;
  out[0] = 0;
  if (!dot) return;
  size_t n = static_cast<size_t>(end - dot - 1);
  if (n >= size) n = size - 1;
  std::memcpy(out, dot + 1, n);
  out[n] = 0;
}

void setPunct(VLLocale *l, int slot, int wide, const char *s) {
  if (std::strlen(s) != 1) return;
  auto b = static_cast<uint8_t>(s[0]);
  l->chars[slot] = b;
  l->wchars[wide] = vl::cp::sbcsUni(l->codePage, b);
}

}  // namespace

void VLMapNativeInfo(const char *native, VLLocale *locale, int /*unusedFlag*/) {
  VL_FLOW("VLMapNativeInfo");
  VLLocale *l = vl::orDefault(locale);
  if (!l || !l->codePage || !vl::cp::body(l->codePage)) return;
  if (!native) native = "";
  Conventions c{};
  {
    vl::LockGuard lock(vl::nat::platformLock());
    char saved[vl::nat::kSaveMax];
    size_t len = 0;
    if (!vl::nat::savePlatform(saved, &len)) {
      VL_ERR("Unable to save current locale to restore. len %d > %d '%s'", static_cast<int>(len),
             static_cast<int>(vl::nat::kSaveMax), std::setlocale(LC_ALL, nullptr));
      return;
    }
    if (!std::setlocale(LC_ALL, native)) {
      VL_DETAIL("Native locale %s not available", native);
      return;
    }
    const lconv *lc = std::localeconv();
    c.fracDigits = lc->frac_digits;
    c.intFracDigits = lc->int_frac_digits;
    c.pCsPrecedes = lc->p_cs_precedes;
    c.pSepBySpace = lc->p_sep_by_space;
    c.nCsPrecedes = lc->n_cs_precedes;
    c.nSepBySpace = lc->n_sep_by_space;
    c.pSignPosn = lc->p_sign_posn;
    c.nSignPosn = lc->n_sign_posn;
    groupingText(lc->grouping, c.grouping, sizeof c.grouping);
    groupingText(lc->mon_grouping, c.monGrouping, sizeof c.monGrouping);
    copyField(c.decimal, sizeof c.decimal, lc->decimal_point);
    copyField(c.thousands, sizeof c.thousands, lc->thousands_sep);
    copyField(c.monDecimal, sizeof c.monDecimal, lc->mon_decimal_point);
    copyField(c.monThousands, sizeof c.monThousands, lc->mon_thousands_sep);
    copyField(c.currency, sizeof c.currency, lc->currency_symbol);
    copyField(c.positive, sizeof c.positive, lc->positive_sign);
    copyField(c.negative, sizeof c.negative, lc->negative_sign);
    const char *name = *native ? native : std::setlocale(LC_ALL, nullptr);
    VLMapNativeLocale(name ? name : "", c.localeName, sizeof c.localeName);
    if (*saved) {
      std::setlocale(LC_ALL, saved);
      VL_STATE("Restored locale: [%d/%d] %s", static_cast<int>(len), static_cast<int>(vl::nat::kSaveMax), saved);
    }
  }
  // Direct stores: these follow the platform without counting as the caller's overrides.
  if (has(c.fracDigits)) l->num[1] = static_cast<uint8_t>(c.fracDigits);
  if (has(c.intFracDigits)) l->num[2] = static_cast<uint8_t>(c.intFracDigits);
  setFlag(l, 0x0001, c.pCsPrecedes);
  setFlag(l, 0x0002, c.pSepBySpace);
  setFlag(l, 0x0004, c.nCsPrecedes);
  setFlag(l, 0x0008, c.nSepBySpace);
  if (has(c.pSignPosn)) l->chars[0] = static_cast<uint8_t>(c.pSignPosn);
  if (has(c.nSignPosn)) l->chars[1] = static_cast<uint8_t>(c.nSignPosn);
  if (c.grouping[0]) VLSetLocaleTextInfo(l, 62, c.grouping, -1, 0);
  if (c.monGrouping[0]) VLSetLocaleTextInfo(l, 68, c.monGrouping, -1, 0);
  // Characters and texts are bytes of the native code page: only usable when the handle
  // has that very code page.
  char cpName[40];
  codePagePart(c.localeName, cpName, sizeof cpName);
  if (std::strncmp(cpName, l->codePage->name, sizeof l->codePage->name) != 0) return;
  setPunct(l, 2, 0, c.decimal);
  setPunct(l, 3, 1, c.thousands);
  setPunct(l, 5, 3, c.monDecimal);
  setPunct(l, 6, 4, c.monThousands);
  if (c.currency[0]) VLSetLocaleTextInfo(l, 64, c.currency, -1, 0);
  if (c.positive[0]) VLSetLocaleTextInfo(l, 71, c.positive, -1, 0);
  if (c.negative[0]) VLSetLocaleTextInfo(l, 72, c.negative, -1, 0);
}
