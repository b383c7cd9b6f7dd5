// One algorithm for VLGetLocale in its three name forms (bytes, W, UTF-16).
#pragma once
#include "locale/locale.h"

namespace vl::loc {

VL_TRACE_MODULE("getloc");

template <class Char>
struct Span {
  const Char *p;
  int32_t n;
};

// Looks a name part up by name; bytes and W go straight to the manager, UTF-16 is narrowed
// (units above 0xFF cannot match an ASCII name and become 0xFF).
template <class Char>
VLObjEntry *byName(VLObjManager *m, uint16_t type, Span<Char> s, uint32_t *rc) {
  if constexpr (std::is_same_v<Char, char>) {
    return VLGetObjFromName(m, type, s.p, s.n, 0, rc);
  } else if constexpr (std::is_same_v<Char, VLWChar>) {
    return VLGetObjFromNameW(m, type, s.p, s.n, 0, rc);
  } else {
    char narrow[64];
    if (s.n >= static_cast<int32_t>(sizeof narrow)) {
      *rc = VL_RC_NOTFOUND;
      return nullptr;
    }
    for (int32_t i = 0; i < s.n; ++i) narrow[i] = static_cast<char>(s.p[i] > 0xFF ? 0xFF : s.p[i]);
    narrow[s.n] = 0;
    return VLGetObjFromName(m, type, narrow, s.n, 0, rc);
  }
}

// A code page part may also be an alias of a code page name.
template <class Char>
VLObjEntry *codePageByName(VLObjManager *m, Span<Char> s, uint32_t *rc) {
  VLObjEntry *e = byName(m, VL_OBJ_CODEPAGE, s, rc);
  if (e || *rc != VL_RC_NOTFOUND || s.n <= 0 || s.n > 64) return e;
  char narrow[65];
  for (int32_t i = 0; i < s.n; ++i) narrow[i] = static_cast<char>(s.p[i] > 0xFF ? 0xFF : s.p[i]);
  narrow[s.n] = 0;
  const char *canonical = VLGetCodepageFromAlias(m, narrow);
  if (!canonical) return nullptr;
  return VLGetObjFromName(m, VL_OBJ_CODEPAGE, canonical, static_cast<int32_t>(std::strlen(canonical)), 0, rc);
}

template <class Char>
int32_t spanUntil(const Char *p, const char *stops) {
  int32_t n = 0;
  for (; p[n]; ++n)
    for (const char *s = stops; *s; ++s)
      if (p[n] == static_cast<Char>(*s)) return n;
  return n;
}

// Outcome of one part's lookup: the entry, or the code the whole call fails with.
struct Part {
  VLObjEntry *entry;
  uint32_t rc;
};

inline uint32_t lookupFailure(uint32_t rc, uint32_t notFound) {
  if (rc == VL_RC_NOTFOUND) return notFound;
  if (rc == VL_RC_NOMEM) return VL_RC_NOMEM;
  return VL_RC_NOMANAGER;
}

template <class Char, class Lookup>
Part part(const Char *&p, Char sep, const char *stops, bool fallback, uint16_t type, uint16_t defaultId,
          VLObjManager *m, uint32_t notFound, Lookup lookup) {
  uint32_t rc = 0;
  if (*p == sep) {
    ++p;
    Span<Char> s{p, spanUntil(p, stops)};
    p += s.n;
    if (s.n > 0) {
      VLObjEntry *e = lookup(s, &rc);
      if (e || (rc == 0 && type == VL_OBJ_SORT)) return {e, 0};
      if (!(rc == VL_RC_NOTFOUND && fallback)) return {nullptr, lookupFailure(rc, notFound)};
    }
  }
  rc = 0;
  VLObjEntry *e = store::objById(m, type, defaultId, 0, &rc);
  if (e || (rc == 0 && type == VL_OBJ_SORT)) return {e, 0};
  return {nullptr, lookupFailure(rc, notFound)};
}

template <class Char>
VLLocale *getLocale(const Char *name, uint32_t options, uint32_t *rcOut) {
  VL_FLOW("VLGetLocale");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (options & ~(VL_LOCALE_USER | VL_LOCALE_FALLBACK)) {
    *rc = VL_RC_BADARG;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  VLObjManager *m = vlglobals ? vlglobals->objManager : nullptr;
  if (!m) {
    *rc = VL_RC_NOMANAGER;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  if (options & VL_LOCALE_USER) {
    // The user's locale is always a byte string.
    char user[132];
    int from = VLGetUserLocale(user, sizeof user);
    VLLocale *l = getLocale<char>(user, options & ~VL_LOCALE_USER, rc);
    // A name mapped from the platform also takes the platform's own conventions.
    if (l && from != 1) {
      VLMapNativeInfo("", l, 0);
      l->lastError = 0;
    }
    VL_RET(l);
  }
  Block<VLLocale> l(sizeof(VLLocale));
  if (!l) {
    *rc = VL_RC_NOMEM;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  std::memset(l.get(), 0, sizeof(VLLocale));
  const bool fallback = (options & VL_LOCALE_FALLBACK) != 0;
  static const Char kEmpty[1] = {0};
  const Char *p = name ? name : kEmpty;

  // Language.
  Span<Char> ls{p, spanUntil(p, "_.@")};
  p += ls.n;
  uint32_t lrc = 0;
  VLObjEntry *lang = nullptr;
  if (ls.n > 0) lang = byName(m, VL_OBJ_LANGUAGE, ls, &lrc);
  if (!lang && (ls.n == 0 || (lrc == VL_RC_NOTFOUND && fallback))) {
    lrc = 0;
    lang = VLGetObjFromName(m, VL_OBJ_LANGUAGE, "English", 7, 0, &lrc);
  }
  if (!lang) {
    *rc = lookupFailure(lrc, VL_RC_NOLANGUAGE);
    VL_ERR("Unable to locate language, rc = %d", static_cast<int>(*rc));
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  l->language = lang;
  auto ids = [&](int w) { return word(lang, w); };

  Part t = part(p, Char('_'), ".@", fallback, VL_OBJ_TERRITORY, ids(0), m, VL_RC_NOTERRITORY,
                [&](Span<Char> s, uint32_t *r) { return byName(m, VL_OBJ_TERRITORY, s, r); });
  if (!t.entry) {
    *rc = t.rc;
    VL_ERR("Unable to locate territory, rc = %d", static_cast<int>(*rc));
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  // Skip anything left of a territory part that the stops did not end (none by construction).
  Part c = part(p, Char('.'), "@", fallback, VL_OBJ_CODEPAGE, ids(1), m, VL_RC_NOCODEPAGE,
                [&](Span<Char> s, uint32_t *r) { return codePageByName(m, s, r); });
  if (!c.entry) {
    *rc = c.rc;
    VL_ERR("Unable to locate code page, rc = %d", static_cast<int>(*rc));
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  Part s = part(p, Char('@'), "", fallback, VL_OBJ_SORT, ids(2), m, VL_RC_NOSORT,
                [&](Span<Char> sp, uint32_t *r) { return byName(m, VL_OBJ_SORT, sp, r); });
  if (s.rc) {
    *rc = s.rc;
    VL_ERR("Unable to locate sort, rc = %d", static_cast<int>(*rc));
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  l->territory = t.entry;
  l->codePage = c.entry;
  l->sort = s.entry;
  l->flags = localeFlagsFor(c.entry);
  if (!s.entry) l->flags |= VL_LF_BINARY;
  l->setMask = 0;
  l->setMaskU = 0;
  uint32_t mrc = deriveModifiable(l.get());
  if (mrc) {
    VL_ERR("Unable to set modifiable values, err = %d", static_cast<int>(mrc));
    releaseTexts(l.get());
    *rc = mrc;
    VL_RET(static_cast<VLLocale *>(nullptr));
  }
  l->lastError = 0;
  VL_RET(l.take());
}

}  // namespace vl::loc
