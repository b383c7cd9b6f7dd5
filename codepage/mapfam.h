// VLMapString, written once: a reader steps the input by the form, a page policy maps
// one character (UTF-16 by the built-in tables, or the locale's code page by its case
// deltas and width tables), and a writer fits whole results into the output.
#pragma once
#include <cstdint>
#include <algorithm>
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

// A language's special-case table (44 upper case, 45 lower case) as VLLangGetSpecial
// reads it: count at word 3 or 4, offset at word 49 or 50, entries of four units. The
// filter holds the first key units by their low ten bits, so most characters skip the
// lookups.
inline int specialTable(Op op) { return op == Op::Upper ? 44 : 45; }
struct Special {
  const VLObjEntry *lang;
  int table;
  bool active = false;
  uint64_t bits[16] = {};
  Special(const VLObjEntry *l, int t) : lang(l), table(t) {
    const auto *b = l ? static_cast<const uint8_t *>(__atomic_load_n(&l->section[0], __ATOMIC_ACQUIRE)) : nullptr;
    if (!b) return;
    const uint16_t count = rd16(b + (t == 44 ? 6 : 8));
    const uint8_t *e = b + rd16(b + 2 * (t + 5));
    for (uint16_t i = 0; i < count; ++i, e += 8) {
      const uint16_t k = rd16(e);
      bits[(k >> 6) & 15] |= uint64_t{1} << (k & 63);
    }
    active = count != 0;
  }
  bool maybe(VLUChar u) const { return ((bits[(u >> 6) & 15] >> (u & 63)) & 1) != 0; }
};

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
bool specialCase(Reader<F> &r, const P &page, uint32_t v, const Special &sp, uint32_t *outv, uint32_t *k) {
  VLUChar o1 = 0, o2 = 0;
  const VLUChar u = page.toUni(v);
  int n = VLLangGetSpecial(sp.lang, u, 0, &o1, &o2, sp.table);
  bool pair = false;
  uint32_t nextV;
  if (!n && r.peek(&nextV)) {
    n = VLLangGetSpecial(sp.lang, u, page.toUni(nextV), &o1, &o2, sp.table);
    pair = n != 0;
  }
  if (!n || !page.fromUni(o1, &outv[0]) || (n == 2 && !page.fromUni(o2, &outv[1]))) return false;
  if (pair) r.next(&nextV);
  *k = static_cast<uint32_t>(n);
  return true;
}

// One character by a mapping other than special casing.
template <Op kOp, class P>
VL_HOT uint32_t mapOne(const P &page, uint32_t v) {
  if constexpr (kOp == Op::Full) {
    return page.full(v);
  } else if constexpr (kOp == Op::Half) {
    return page.half(v);
  } else if constexpr (kOp == Op::Lower) {
    return page.lower(v);
  } else if constexpr (kOp == Op::Upper) {
    return page.upper(v);
  } else if constexpr (kOp == Op::Digits) {
    if (page.isDigit(v))
      if (VLUChar d = umap::asciiDigit(page.toUni(v))) {
        uint32_t x;
        if (page.fromUni(d, &x)) return x;
      }
    return v;
  } else {
    return v;
  }
}

// Maps r's characters into w; true when the input ran out before the output. sp is the
// special-case table in use, if any.
template <Op kOp, class F, class P, class W>
bool mapChars(Reader<F> &r, const P &page, W &w, const Special *sp) {
  if constexpr (F::kUnits) {
    if (!sp) {  // one unit in, one unit out
      Walk<F> &in = r.w;
      const uint32_t m = std::min(in.n - in.pos, w.cap - w.pos);
      const U<F> *s = in.s + in.pos;
      U<F> *o = w.out + w.pos;
      for (uint32_t i = 0; i < m; ++i) o[i] = static_cast<U<F>>(mapOne<kOp>(page, s[i]));
      in.pos += m;
      w.pos += m;
      return in.pos == in.n;
    }
  }
  uint32_t v;
  while (r.next(&v)) {
    uint32_t outv[2] = {v, 0}, k = 1;
    bool hit = false;
    if constexpr (kOp == Op::Lower || kOp == Op::Upper)
      hit = sp && sp->maybe(page.toUni(v)) && specialCase(r, page, v, *sp, outv, &k);
    if (!hit) outv[0] = mapOne<kOp>(page, v);
    if (!w.put(outv, k)) return false;
  }
  return true;
}

// The whole member for one form once the selector and handle are checked.
template <class F, class P, class W>
int32_t mapString(F f, const P &page, W w, const U<F> *in, int32_t inLen, Sel sel, const VLObjEntry *lang) {
  const uint32_t n = resolveLen(in, inLen, 1);
  Reader<F> r{Walk<F>{f, in, n}};
  const Special sp(sel.special ? lang : nullptr, specialTable(sel.op));
  const Special *use = sp.active ? &sp : nullptr;
  bool done = true;
  switch (sel.op) {
    case Op::Full: done = mapChars<Op::Full>(r, page, w, use); break;
    case Op::Half: done = mapChars<Op::Half>(r, page, w, use); break;
    case Op::Lower: done = mapChars<Op::Lower>(r, page, w, use); break;
    case Op::Upper: done = mapChars<Op::Upper>(r, page, w, use); break;
    case Op::Digits: done = mapChars<Op::Digits>(r, page, w, use); break;
    case Op::Copy: done = mapChars<Op::Copy>(r, page, w, use); break;
  }
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
