// Finds and opens a catalog through the path template, "VL_NLSPATH" and the bare name,
// first with the caller's locale in the substitutions, then with the default locale.
#include <sys/stat.h>

#include "catalog/catalog.h"

VL_TRACE_MODULE("vlopcat");

namespace {

using Text = vl::Block<char>;

// The texts a template may ask for: %N, %l (language code), %t (territory code).
struct Subst {
  const char *name;
  char lang[64] = {0}, terr[64] = {0};
  Subst(VLLocale *l, const char *n) : name(n) {
    VLGetLocaleTextInfo(l, 3, lang, sizeof lang - 1, 0);
    VLGetLocaleTextInfo(l, 7, terr, sizeof terr - 1, 0);
  }
  size_t longest() const { return std::strlen(name) + sizeof lang + sizeof terr; }
};

char *put(char *out, const char *s) {
  size_t n = std::strlen(s);
  std::memcpy(out, s, n);
  return out + n;
}

// Walks the ";"-separated candidates, substituting as it goes, and opens the first file
// that opens. Separators and "%" count only as whole single-byte characters.
VLFile *search(VLLocale *l, const char *list, const Subst &sub, char *cand, uint32_t *rcOut) {
  using namespace vl::cp;
  const bool shift = vl::step::isShifted(l);
  const uint8_t *lens = body(l->codePage) + kLenTable;
  const uint8_t so = shiftOut(l->codePage), si = shiftIn(l->codePage), dbl = maxLen(l->codePage);
  const bool single = (l->flags & VL_LF_SINGLEBYTE) != 0;
  uint32_t state = 0;
  char *out = cand;
  for (const char *p = list; *p;) {
    const auto b = static_cast<uint8_t>(*p);
    if (shift && (b == so || b == si)) {
      state = b == so;
      *out++ = *p++;
      continue;
    }
    uint32_t len = shift ? (state ? dbl : 1u) : single ? 1u : (lens[b] ? lens[b] : 1u);
    if (len == 1 && *p == ';') {
      *out = 0;
      ++p;
      if (out != cand) {
        uint32_t rc = 0;
        VL_DETAIL("Trying catalog %s", cand);
        VLFile *f = VLOpenFile(vlglobals ? vlglobals->fileContext : 0, cand, VL_FILE_READ, 0, &rc);
        // A directory opens too, but holds no catalog.
        struct stat st;
        if (f && ::fstat(f->descriptor, &st) == 0 && S_ISREG(st.st_mode)) return f;
        if (f) VLCloseFile(f, 0);
        if (rc == VL_RC_NOMEM) return *rcOut = rc, nullptr;
      }
      out = cand;
      state = 0;
      continue;
    }
    if (len == 1 && *p == '%') {
      switch (p[1]) {
        case 'N': out = put(out, sub.name); p += 2; continue;
        case 'l': out = put(out, sub.lang); p += 2; continue;
        case 't': out = put(out, sub.terr); p += 2; continue;
        case 'L': out = put(put(put(out, sub.lang), "_"), sub.terr); p += 2; continue;
        case '%': *out++ = '%'; p += 2; continue;
        default: break;  // the "%" stays and what follows is plain text
      }
    }
    for (uint32_t i = 0; i < len && *p; ++i) *out++ = *p++;
  }
  return nullptr;
}

}  // namespace

VLCatalog *VLOpenCatalog(VLLocale *locale, const char *pathTemplate, const char *name, uint32_t options) {
  VL_FLOW("VLOpenCatalog");
  using namespace vl::cat;
  VLLocale *l = vl::step::use(locale);
  VLLocale *report = vl::orDefault(locale);
  if ((options & ~kOneMask) || !name || !*name || !l) {
    vl::setRc(report, VL_RC_BADARG);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  vl::setRc(l, VL_RC_OK);
  if (!pathTemplate) pathTemplate = "";
  // The whole variable, however long.
  char probe[1];
  int envLen = VLGetEnv("VL_NLSPATH", probe, 0);
  Text env(size_t(envLen > 0 ? envLen : 1));
  Text list(std::strlen(pathTemplate) + size_t(envLen > 0 ? envLen : 0) + std::strlen(name) + 5);
  if (!env || !list) {
    fail(l, VL_RC_NOMEM);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  env.get()[0] = 0;
  if (envLen > 0) VLGetEnv("VL_NLSPATH", env.get(), envLen);
  char *o = list.get();
  for (const char *part : {pathTemplate, static_cast<const char *>(env.get())})
    if (*part) o = put(put(o, part), ";");
  *put(put(o, name), ";") = 0;

  Subst first(l, name);
  size_t percents = 0;
  for (const char *p = list.get(); *p; ++p) percents += *p == '%';
  Text cand(std::strlen(list.get()) + percents * first.longest() + 1);
  if (!cand) {
    fail(l, VL_RC_NOMEM);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  uint32_t rc = VL_RC_CAT_INVALID;
  VLFile *file = search(l, list.get(), first, cand.get(), &rc);
  if (!file && rc == VL_RC_CAT_INVALID && (options & VL_CAT_ONEPASS) != VL_CAT_ONEPASS) {
    uint32_t getRc = 0;
    if (VLLocale *def = VLGetLocale("", VL_LOCALE_FALLBACK, &getRc)) {
      if (vl::step::use(def)) file = search(def, list.get(), Subst(def, name), cand.get(), &rc);
      VLReleaseLocale(def);
    } else if (getRc == VL_RC_NOMEM) {
      rc = getRc;
    }
  }
  if (!file) {
    VL_ERR("Catalog %s not found, rc = %u", name, rc);
    fail(l, rc);
    VL_RET(static_cast<VLCatalog *>(nullptr));
  }
  VLCatalog *c = VLMcLoadCat(l, file, options);
  if (!c) VLCloseFile(file, 0);
  VL_RET(c);
}
