// VLMapString, written once: a reader steps the input by the form, a page policy maps
// one character (UTF-16 by the built-in tables, or the locale's code page by its case
// deltas and width tables), and a writer fits whole results into the output.
#pragma once
#include <cstdint>
#include <cstring>

#include "codepage/step.h"
#include "codepage/unimap.h"

namespace vl::map {

using namespace vl::step;

enum class Op { Copy, Full, Half, Lower, Upper, Digits };
struct Sel {
  Op op = Op::Copy;
  bool special = false;  // case mapping through the language's special-case table
  bool chars = false;    // VL_OPT_CHARLEN was given
};

// False for a selector outside the family.
inline bool parse(uint32_t selector, Sel *s) {
  s->chars = (selector & VL_OPT_CHARLEN) != 0;
  switch (selector & ~VL_OPT_CHARLEN) {
    case 0:
    case VL_MAP_COPY: s->op = Op::Copy; return true;
    case VL_MAP_FULLWIDTH: s->op = Op::Full; return true;
    case VL_MAP_HALFWIDTH: s->op = Op::Half; return true;
    case VL_MAP_LOWER: s->op = Op::Lower, s->special = true; return true;
    case VL_MAP_UPPER: s->op = Op::Upper, s->special = true; return true;
    case VL_MAP_LOWER | VL_MAP_NOSPECIAL: s->op = Op::Lower; return true;
    case VL_MAP_UPPER | VL_MAP_NOSPECIAL: s->op = Op::Upper; return true;
    case VL_MAP_DIGITS: s->op = Op::Digits; return true;
    default: return false;
  }
}

// Special-case tables: 44 upper case, 45 lower case; their counts are words 3 and 4.
inline int specialTable(Op op) { return op == Op::Upper ? 44 : 45; }
inline bool hasSpecial(const VLObjEntry *lang, int table) {
  if (!lang) return false;
  const auto *b = static_cast<const uint8_t *>(__atomic_load_n(&lang->section[0], __ATOMIC_ACQUIRE));
  return b && rd16(b + (table == 44 ? 6 : 8)) != 0;
}

// ---- Page policies: one character as a 32-bit value ----------------------------------

struct UniPage {
  VLUChar toUni(uint32_t v) const { return static_cast<VLUChar>(v); }
  bool fromUni(VLUChar u, uint32_t *v) const {
    *v = u;
    return true;
  }
  uint32_t full(uint32_t v) const { return umap::toFull(static_cast<VLUChar>(v)); }
  uint32_t half(uint32_t v) const { return umap::toHalf(static_cast<VLUChar>(v)); }
  uint32_t lower(uint32_t v) const { return umap::toLower(static_cast<VLUChar>(v)); }
  uint32_t upper(uint32_t v) const { return umap::toUpper(static_cast<VLUChar>(v)); }
  bool isDigit(uint32_t v) const { return (unicodeType(v) & 0x008) != 0; }
};

// W values of a code page; one-byte values go through the single-byte tables. UTF-8 is
// mapped as the Unicode it encodes, like its classification.
struct CpPage {
  const VLCodePage *c;
  bool utf8 = cp::isUtf8(c);
  template <class Fn>
  uint32_t viaUnicode(uint32_t v, Fn fn) const {
    const VLUChar u = toUni(v);
    return u == cp::kReplacement ? v : cp::uniToUtf8W(fn(u));  // a stray byte stays as it is
  }
  VLUChar toUni(uint32_t v) const { return v <= 0xFF ? cp::sbcsUni(c, static_cast<uint8_t>(v)) : cp::wToUni(c, v); }
  // Only a unit the page holds: a substitution byte would change text silently.
  bool fromUni(VLUChar u, uint32_t *v) const {
    *v = cp::uniToW(c, u);
    return u != cp::kReplacement && toUni(*v) == u;
  }
  uint32_t full(uint32_t v) const {
    if (utf8) return viaUnicode(v, umap::toFull);
    VLWChar f = cp::halfToFull(c, v);
    return f ? f : v;
  }
  uint32_t half(uint32_t v) const {
    if (utf8) return viaUnicode(v, umap::toHalf);
    VLWChar h = cp::fullToHalf(c, v);
    return h ? h : v;
  }
  // Mask 0x002 changes upper-case characters, 0x004 lower-case ones.
  uint32_t lower(uint32_t v) const { return utf8 ? viaUnicode(v, umap::toLower) : cp::caseConvW(c, v, 0x002); }
  uint32_t upper(uint32_t v) const { return utf8 ? viaUnicode(v, umap::toUpper) : cp::caseConvW(c, v, 0x004); }
  bool isDigit(uint32_t v) const {
    return ((v <= 0xFF ? cp::sbcsType(c, static_cast<uint8_t>(v)) : wType(c, v)) & 0x008) != 0;
  }
};

// ---- Readers: one character at a time --------------------------------------------------

template <class F>
struct Reader {
  Walk<F> w;
  bool next(uint32_t *v) {
    uint32_t at, len;
    if (!w.next(at, len)) return false;
    if constexpr (F::kUnits)
      *v = w.s[at];
    else
      *v = cp::readW(w.s + at, len);
    return true;
  }
  bool peek(uint32_t *v) const {
    Reader copy = *this;
    return copy.next(v);
  }
};

// ---- Writers: a result goes in whole or not at all -------------------------------------

template <class T>
struct UnitWriter {
  T *out;
  uint32_t cap, pos = 0;
  bool put(const uint32_t *v, uint32_t k) {
    if (cap - pos < k) return false;
    for (uint32_t i = 0; i < k; ++i) out[pos++] = static_cast<T>(v[i]);
    return true;
  }
  void finish(uint32_t, bool) {}
};

struct ByteWriter {
  uint8_t *out;
  uint32_t cap, pos = 0;
  bool put(const uint32_t *v, uint32_t k) {
    uint8_t tmp[8];
    uint32_t n = 0;
    for (uint32_t i = 0; i < k; ++i) n += static_cast<uint32_t>(cp::wToMb(tmp + n, v[i]));
    if (cap - pos < n) return false;
    std::memcpy(out + pos, tmp, n);
    pos += n;
    return true;
  }
  void finish(uint32_t, bool) {}
};

// Writes its own shift bytes as the mapped characters change state, and keeps room for
// the Shift-In that closes a double-byte run.
struct ShiftWriter {
  uint8_t *out;
  uint32_t cap, pos = 0;
  uint32_t state;
  uint8_t so, si;
  bool put(const uint32_t *v, uint32_t k) {
    uint8_t tmp[12];
    uint32_t n = 0, st = state;
    for (uint32_t i = 0; i < k; ++i) {
      const uint32_t want = v[i] > 0xFF ? 1u : 0u;
      if (want != st) tmp[n++] = want ? so : si;
      st = want;
      n += static_cast<uint32_t>(cp::wToMb(tmp + n, v[i]));
    }
    if (cap - pos < n + st) return false;
    std::memcpy(out + pos, tmp, n);
    pos += n;
    state = st;
    return true;
  }
  // A cut output, or one whose input closed its run, ends in the single-byte state.
  void finish(uint32_t inState, bool cut) {
    if (state && (cut || !inState)) out[pos++] = si;
  }
};

// ---- The mapping ----------------------------------------------------------------------

template <class F, class P>
bool specialCase(Reader<F> &r, const P &page, uint32_t v, const VLObjEntry *lang, int table, uint32_t *outv,
                 uint32_t *k) {
  VLUChar o1 = 0, o2 = 0;
  const VLUChar u = page.toUni(v);
  int n = VLLangGetSpecial(lang, u, 0, &o1, &o2, table);
  bool pair = false;
  uint32_t nextV;
  if (!n && r.peek(&nextV)) {
    n = VLLangGetSpecial(lang, u, page.toUni(nextV), &o1, &o2, table);
    pair = n != 0;
  }
  if (!n || !page.fromUni(o1, &outv[0]) || (n == 2 && !page.fromUni(o2, &outv[1]))) return false;
  if (pair) r.next(&nextV);
  *k = static_cast<uint32_t>(n);
  return true;
}

// Maps r's characters into w; true when the input ran out before the output.
template <class F, class P, class W>
bool mapChars(Reader<F> &r, const P &page, W &w, Sel sel, const VLObjEntry *lang) {
  const int table = specialTable(sel.op);
  const bool special = sel.special && hasSpecial(lang, table);
  uint32_t v;
  while (r.next(&v)) {
    uint32_t outv[2] = {v, 0}, k = 1;
    switch (sel.op) {
      case Op::Full: outv[0] = page.full(v); break;
      case Op::Half: outv[0] = page.half(v); break;
      case Op::Lower:
      case Op::Upper:
        if (!(special && specialCase(r, page, v, lang, table, outv, &k)))
          outv[0] = sel.op == Op::Lower ? page.lower(v) : page.upper(v);
        break;
      case Op::Digits:
        if (page.isDigit(v))
          if (VLUChar d = umap::asciiDigit(page.toUni(v))) {
            uint32_t x;
            if (page.fromUni(d, &x)) outv[0] = x;
          }
        break;
      case Op::Copy: break;
    }
    if (!w.put(outv, k)) return false;
  }
  return true;
}

// The whole member for one form once the selector and handle are checked.
template <class F, class P, class W>
int32_t mapString(F f, const P &page, W w, const U<F> *in, int32_t inLen, Sel sel, const VLObjEntry *lang) {
  const uint32_t n = resolveLen(in, inLen, 1);
  Reader<F> r{Walk<F>{f, in, n}};
  const bool done = mapChars(r, page, w, sel, lang);
  w.finish(r.w.f.state, !done);
  return static_cast<int32_t>(w.pos);
}

// Refuses a bad selector; otherwise sets lastError 0.
inline bool accept(VLLocale *l, uint32_t selector, Sel *sel) {
  if (!parse(selector, sel)) {
    setRc(orDefault(l), VL_RC_BADARG);
    return false;
  }
  setRc(orDefault(l), VL_RC_OK);
  return true;
}

inline const VLObjEntry *languageOf(const VLLocale *l) { return l ? l->language : nullptr; }

}  // namespace vl::map
