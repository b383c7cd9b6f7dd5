// Comparison of encoded values, optionally folding case or width or ignoring trailing
// blanks, written once over the forms of codepage/step.h: plain bytes, Ex (shift
// states), W values and UTF-16 units.
#pragma once
#include <algorithm>
#include <cstdint>
#include <cstring>
#include <tuple>

#include "codepage/cpprim.h"
#include "codepage/mapfam.h"
#include "codepage/step.h"
#include "codepage/unimap.h"
#include "store/store.h"
#include "string/trunc.h"

namespace vl::str {

constexpr uint32_t kCmpRejected = 0x7fdfbfbeu;
constexpr uint32_t kCmpBlanks = VL_CMP_NOBLANKS;
constexpr uint32_t kMapUpperSel = VL_MAP_UPPER;
constexpr uint32_t kFoldMask = 0x004;  // lower-case characters change: everything folds to upper case

// The handle a comparison works in, lastError set; null (the result is then 0) without
// one or for a refused option word.
inline VLLocale *cmpLocale(VLLocale *locale, bool refused) {
  VLLocale *l = use(locale);
  if (!l) return nullptr;
  setRc(l, refused ? VL_RC_BADARG : VL_RC_OK);
  return refused ? nullptr : l;
}

enum class Mode { Exact, Case, Width };
inline Mode modeOf(uint32_t opts) {
  opts &= ~(kCmpBlanks | VL_OPT_CHARLEN);
  if (!opts) return Mode::Exact;
  return (opts & VL_CMP_NOWIDTH) == VL_CMP_NOWIDTH ? Mode::Width : Mode::Case;
}

// The language's special-casing flag: word 51 of a body whose header reaches it (the
// special-case tables and the first text start after it).
inline bool specialCasing(const VLLocale *l) {
  const VLObjEntry *lang = l->language;
  if (!lang) return false;
  const auto *b = static_cast<const uint8_t *>(__atomic_load_n(&lang->section[0], __ATOMIC_ACQUIRE));
  if (!b || lang->sectionSize[0] < 104) return false;
  if (rd16(b + 98) < 104 || rd16(b + 100) < 104 || rd16(b + 10) < 104) return false;
  return rd16(b + 102) != 0;
}

inline const uint8_t *foldTable(const VLLocale *l) { return cp::body(l->codePage) + cp::kSbcsUpper; }

// A difference whose sign survives the narrowing.
inline int32_t diff(int64_t a, int64_t b) {
  int64_t d = a - b;
  return d > INT32_MAX ? INT32_MAX : d < INT32_MIN ? INT32_MIN : static_cast<int32_t>(d);
}

// Hook block size for `per` bytes a unit; a product past 31 bits asks for 0x7fffffff.
inline size_t mappedBytes(uint32_t n, uint32_t per) {
  uint64_t b = uint64_t{n} * per;
  return b > 0x7fffffffu ? 0x7fffffffu : static_cast<size_t>(b);
}

// True when u is the first unit of an upper-case special key (single or pair).
inline bool startsKey(const map::Special &sp, VLUChar u) {
  if (!sp.active || !sp.maybe(u)) return false;
  const auto *b = static_cast<const uint8_t *>(__atomic_load_n(&sp.lang->section[0], __ATOMIC_ACQUIRE));
  const uint16_t count = rd16(b + 6);
  const uint8_t *e = b + rd16(b + 2 * 49);
  for (uint16_t i = 0; i < count; ++i, e += 8)
    if (rd16(e) == u) return true;
  return false;
}

// The language's upper-case special keys, filtered by first unit, and per one-byte value
// its folded form with flags: kKey when it starts a key, kNul for the 0 that may end a
// string. The common case (equal folds, no flag) then costs one table read a side.
// ufold does the same for UTF-16 units below 256, kSlow marking the two whose upper case
// lies above.
constexpr uint16_t kKey = 0x100, kNul = 0x200, kSlow = 0x400;
struct Keys {
  map::Special sp{nullptr, 44};
  bool special = false;  // the language's flag
  uint16_t fold[256] = {}, ufold[256] = {};
  bool byte(uint32_t v) const { return (fold[v] & kKey) != 0; }
};

// Building the filter walks the whole table, so each thread keeps the last one and
// rebuilds it when the language, its body, the code page or the unload count changes.
inline const Keys &upperKeys(const VLLocale *l) {
  struct Cache {
    const VLObjEntry *lang = nullptr, *page = nullptr;
    const void *body = nullptr;
    uint32_t unloads = 0;
    Keys k;
  };
  static thread_local Cache c;
  const VLObjEntry *lang = l->language;
  const uint32_t gen = store::unloads.load(std::memory_order_acquire);
  const void *b = lang ? __atomic_load_n(&lang->section[0], __ATOMIC_ACQUIRE) : nullptr;
  if (c.lang != lang || c.page != l->codePage || c.body != b || c.unloads != gen) {
    c.k.special = specialCasing(l);
    c.k.sp = map::Special(c.k.special ? lang : nullptr, 44);
    const uint8_t *t = foldTable(l);
    for (uint32_t v = 0; v < 256; ++v) {
      const uint16_t nul = v ? 0 : kNul;
      c.k.fold[v] = static_cast<uint16_t>(
          t[v] | (startsKey(c.k.sp, cp::sbcsUni(l->codePage, static_cast<uint8_t>(v))) ? kKey : 0) | nul);
      const VLUChar up = umap::toUpper(static_cast<VLUChar>(v));
      const bool key = startsKey(c.k.sp, static_cast<VLUChar>(v));
      c.k.ufold[v] = static_cast<uint16_t>((up < 256 ? up : kSlow) | (key ? kKey : 0) | nul);
    }
    c.lang = lang, c.page = l->codePage, c.body = b, c.unloads = gen;
  }
  return c.k;
}

// Whether special casing can change anything in s: without a key start, upper-casing it
// with and without the special table gives the same text.
template <class F>
bool bytesNeedSpecial(const Keys &keys, const VLCodePage *c, F f, const uint8_t *s, uint32_t n) {
  if (!keys.sp.active) return false;
  if (!F::kShift && f.singleByte()) {
    for (uint32_t i = 0; i < n; ++i)
      if (keys.byte(s[i])) return true;
    return false;
  }
  const map::CpPage page{c};
  Walk<F> w{f, s, n};
  uint32_t at, k;
  while (w.next(at, k))
    if (k == 1 ? keys.byte(s[at]) : startsKey(keys.sp, page.toUni(cp::readW(s + at, k)))) return true;
  return false;
}

// Both strings upper-cased into blocks of `per` bytes a unit, then compared as bytes.
// map(out, capacityUnits, s, n, which, selector) gives units. Special casing always
// takes hook blocks; the plain upper case of short strings maps on the stack.
template <class T, class Map>
int32_t compareMapped(VLLocale *l, const T *s1, uint32_t n1, const T *s2, uint32_t n2, uint32_t per, bool swap,
                      bool special, Map map) {
  constexpr size_t kLocal = 1024;
  const size_t b1 = mappedBytes(n1, per), b2 = mappedBytes(n2, per);
  alignas(8) uint8_t local[2][kLocal];
  const bool onStack = !special && b1 <= kLocal && b2 <= kLocal;
  Block<T> m1(onStack ? 0 : b1), m2(onStack ? 0 : b2);
  T *o1 = onStack ? reinterpret_cast<T *>(local[0]) : m1.get();
  T *o2 = onStack ? reinterpret_cast<T *>(local[1]) : m2.get();
  if (!o1 || !o2) {
    setRc(l, VL_RC_NOMEM);
    return 0;
  }
  const uint32_t sel = special ? kMapUpperSel : kMapUpperSel | VL_MAP_NOSPECIAL;
  int32_t k1 = map(o1, static_cast<int32_t>(b1 / sizeof(T)), s1, n1, 0, sel);
  int32_t k2 = map(o2, static_cast<int32_t>(b2 / sizeof(T)), s2, n2, 1, sel);
  k1 = std::max(k1, 0);
  k2 = std::max(k2, 0);
  if (swap) {
    VLStrBigEndian(o1, k1 * static_cast<int32_t>(sizeof(T)));
    VLStrBigEndian(o2, k2 * static_cast<int32_t>(sizeof(T)));
  }
  int r = std::memcmp(o1, o2, sizeof(T) * static_cast<uint32_t>(std::min(k1, k2)));
  return r ? r : k1 - k2;
}

// Length of a byte string as the caller gave it: negative to the 0, characters made bytes,
// cut back to whole characters (shift bytes included).
template <class F>
uint32_t byteLength(F f, const uint8_t *s, int32_t len, bool chars) {
  if (!s) return 0;
  if (len < 0) return length(s);
  if (chars) return unitsOf(f, s, static_cast<uint32_t>(len));
  if (!F::kShift && f.singleByte()) return static_cast<uint32_t>(len);
  Walk<F> w{f, s, static_cast<uint32_t>(len)};
  uint32_t at, n;
  while (w.next(at, n)) {
  }
  return w.pos;
}

// Trailing blanks dropped through truncation of a scratch copy; the caller's bytes are
// compared with the shorter length. False without a scratch block: the caller cannot
// compare as asked.
template <class F>
bool dropBlanks(VLLocale *l, F f1, const uint8_t *s1, uint32_t *n1, F f2, const uint8_t *s2, uint32_t *n2,
                bool width) {
  Block<char> buf(size_t{std::max(*n1, *n2)} + 1);
  if (!buf) return false;
  const uint32_t opts = kTrimBlanks | (width ? kFoldWidth : 0);
  auto one = [&](F f, const uint8_t *s, uint32_t *n) {
    if (*n) std::memcpy(buf.get(), s, *n);
    buf.get()[*n] = 0;
    int32_t r = F::kShift ? VLTruncateStringEx(l, buf.get(), f.state, static_cast<int32_t>(*n) + 1, opts)
                          : VLTruncateString(l, buf.get(), static_cast<int32_t>(*n) + 1, opts);
    if (r <= 0) return;
    uint32_t k = static_cast<uint32_t>(r - 1);
    // A Shift-In the cut added is not in the caller's string.
    if constexpr (F::kShift)
      if (k && k <= *n && static_cast<uint8_t>(buf.get()[k - 1]) == f.si && s[k - 1] != f.si) --k;
    *n = std::min(*n, k);
  };
  one(f1, s1, n1);
  one(f2, s2, n2);
  return true;
}

// One character folded to upper case into four zeroed bytes.
template <class F>
void foldCase(const VLLocale *l, const uint8_t *p, uint32_t n, uint8_t out[4]) {
  std::memset(out, 0, 4);
  if (n == 1) {
    out[0] = foldTable(l)[*p];
    return;
  }
  if constexpr (F::kShift)
    VLCpMbCaseConvS(l->codePage, p, out, kFoldMask);
  else
    cp::caseConv(l->codePage, p, n, out, kFoldMask);
}

// One character narrowed to half width; a character without a narrow form stays.
inline uint32_t foldWidth(const VLCodePage *c, const uint8_t *p, uint32_t n, uint8_t out[4]) {
  std::memset(out, 0, 4);
  if (n > 1) {
    VLWChar h = cp::fullToHalf(c, cp::readW(p, n));
    if (h) return static_cast<uint32_t>(cp::wToMb(out, h));
  }
  std::memcpy(out, p, std::min(n, 4u));
  return n;
}

inline int32_t firstDiff(const uint8_t a[4], const uint8_t b[4]) {
  for (int i = 0; i < 4; ++i)
    if (a[i] != b[i]) return a[i] - b[i];
  return 0;
}

// Case-insensitive walk of two byte strings side by side over n bytes. byteOrder: stand
// in for the mapping, which orders characters of different lengths by their bytes
// (a half-width katakana after a double-byte character led by 0x82); without it the
// shorter character sorts first.
template <class F>
int32_t compareCase(const VLLocale *l, F f1, const uint8_t *s1, F f2, const uint8_t *s2, uint32_t n,
                    bool byteOrder) {
  uint8_t a[4], b[4];
  if (!F::kShift && f1.singleByte()) {
    const uint8_t *t = foldTable(l);
    for (uint32_t i = 0; i < n; ++i)
      if (t[s1[i]] != t[s2[i]]) return t[s1[i]] - t[s2[i]];
    return 0;
  }
  if constexpr (F::kShift) {
    const int32_t c1 = f1.len(s1), c2 = f2.len(s2);
    if (c1 != c2 || static_cast<uint32_t>(c1) > n) return c1 - c2;
  }
  uint32_t p = 0;
  while (p < n) {
    if constexpr (F::kShift) {
      const bool sh1 = f1.isShift(s1[p]), sh2 = f2.isShift(s2[p]);
      if (sh1 && s1[p] == s2[p]) {
        f1.shift(s1[p]);
        f2.shift(s2[p]);
        ++p;
        continue;
      }
      if (sh1 || sh2) {
        if (sh1 && f1.state == 1) return -1;
        if (sh2 && f2.state == 1) return 1;
        return s1[p] - s2[p];
      }
    }
    const uint32_t k1 = f1.len(s1 + p), k2 = f2.len(s2 + p);
    if (k1 != k2 && byteOrder) {
      foldCase<F>(l, s1 + p, k1, a);
      foldCase<F>(l, s2 + p, k2, b);
      const int r = std::memcmp(a, b, std::min({k1, k2, 4u}));
      return r ? r : diff(k1, k2);
    }
    if (k1 != k2 || n - p < k1) return diff(k1, k2);
    foldCase<F>(l, s1 + p, k1, a);
    foldCase<F>(l, s2 + p, k2, b);
    if (int32_t r = firstDiff(a, b)) return r;
    p += k1;
  }
  return 0;
}

// Width-insensitive walk: each string at its own pace, shift bytes passed.
template <class F>
int32_t compareWidth(const VLLocale *l, F f1, const uint8_t *s1, uint32_t *n1, F f2, const uint8_t *s2,
                     uint32_t *n2) {
  Walk<F> w1{f1, s1, *n1}, w2{f2, s2, *n2};
  uint32_t at1 = 0, k1 = 0, at2 = 0, k2 = 0;
  uint8_t a[4], b[4];
  for (;;) {
    const bool more1 = w1.next(at1, k1), more2 = w2.next(at2, k2);
    if (!more1 || !more2) {
      *n1 -= more1 ? at1 : w1.pos;
      *n2 -= more2 ? at2 : w2.pos;
      return 0;
    }
    const uint32_t m1 = foldWidth(l->codePage, s1 + at1, k1, a), m2 = foldWidth(l->codePage, s2 + at2, k2, b);
    if (m1 != m2) return diff(m1, m2);
    if (int32_t r = firstDiff(a, b)) return r;
  }
}

template <class F>
void dump(Tracer &trc, const uint8_t *s1, uint32_t n1, const uint8_t *s2, uint32_t n2) {
  if (!trc.on(TRC1_STATE)) return;
  TRC1_Printf(trc.record(), "String1: %.*s", static_cast<int>(n1), reinterpret_cast<const char *>(s1));
  TRC1_Printf(trc.record(), "String2: %.*s", static_cast<int>(n2), reinterpret_cast<const char *>(s2));
}

// Case folded in a single-byte page: one pass over both strings up to the first
// difference, the terminators of strlen lengths found on the way. False when a key start
// comes first: only then can the mapping order the pair otherwise (what follows the
// first difference cannot change the sign). Results are those of the general path.
inline bool foldSingle(const Keys &k, const uint8_t *s1, int32_t len1, const uint8_t *s2, int32_t len2,
                       int32_t *r) {
  const uint32_t m1 = len1 < 0 ? UINT32_MAX : static_cast<uint32_t>(len1);
  const uint32_t m2 = len2 < 0 ? UINT32_MAX : static_cast<uint32_t>(len2);
  const uint32_t n = std::min(m1, m2);
  uint32_t i = 0;
  for (; i < n; ++i) {
    const uint32_t a = k.fold[s1[i]], b = k.fold[s2[i]];
    if (a == b && !(a & (kKey | kNul))) continue;
    if ((a | b) & kKey) return false;
    const bool end1 = len1 < 0 && !s1[i], end2 = len2 < 0 && !s2[i];
    if (end1 || end2) {
      const uint32_t n1 = end1 ? i : len1 < 0 ? i + length(s1 + i) : m1;
      *r = diff(n1, end2 ? i : len2 < 0 ? i + length(s2 + i) : m2);
      return true;
    }
    if (a != b) {
      *r = static_cast<int32_t>(a & 0xFF) - static_cast<int32_t>(b & 0xFF);
      return true;
    }
  }
  *r = diff(len1 < 0 ? n + length(s1 + n) : m1, len2 < 0 ? n + length(s2 + n) : m2);
  return true;
}

// The byte members after the option word has passed: plain (Bytes) and Ex (Shifted).
template <class F, class Map>
int32_t compareBytes(VLLocale *l, F f1, const uint8_t *s1, int32_t len1, F f2, const uint8_t *s2, int32_t len2,
                     uint32_t opts, Tracer &trc, Map map) {
  const bool chars = (opts & VL_OPT_CHARLEN) != 0;
  const Mode mode = modeOf(opts);
  if constexpr (!F::kShift)
    if (mode == Mode::Case && f1.singleByte() && s1 && s2 && !(opts & kCmpBlanks) && !trc.on(TRC1_STATE)) {
      int32_t r;
      if (foldSingle(upperKeys(l), s1, len1, s2, len2, &r)) return r;
    }
  uint32_t n1 = byteLength(f1, s1, len1, chars), n2 = byteLength(f2, s2, len2, chars);
  if ((opts & kCmpBlanks) && (n1 || n2) && !dropBlanks(l, f1, s1, &n1, f2, s2, &n2, mode == Mode::Width)) {
    setRc(l, VL_RC_NOMEM);
    return 0;
  }
  if constexpr (F::kShift) {
    for (auto [f, s, n] : {std::tuple{&f1, &s1, &n1}, std::tuple{&f2, &s2, &n2}})
      if (*n && f->isShift(**s)) {
        f->shift(**s);
        ++*s;
        --*n;
      }
    VL_TRC_AT(trc, TRC1_STATE, "len1 = %d, str1state = %d, len2 = %d, str2state = %d", int(n1), int(f1.state),
              int(n2), int(f2.state));
  }
  dump<F>(trc, s1, n1, s2, n2);
  if (!n1 || !n2) return diff(n1, n2);
  const uint32_t n = std::min(n1, n2);
  int32_t r = 0;
  switch (mode) {
    case Mode::Exact:
      r = std::memcmp(s1, s2, n);
      break;
    case Mode::Case: {
      const Keys &keys = upperKeys(l);
      if (keys.special) {
        const bool special =
            bytesNeedSpecial(keys, l->codePage, f1, s1, n1) || bytesNeedSpecial(keys, l->codePage, f2, s2, n2);
        // Other pages fold through their tables below, exactly as the mapping would; UTF-8
        // has no type records to fold by.
        if (special || F::kShift || cp::isUtf8(l->codePage)) {
          auto byteMap = [&](uint8_t *out, int32_t cap, const uint8_t *s, uint32_t k, int which, uint32_t sel) {
            return map(cb(out), cap, cb(s), static_cast<int32_t>(k), which ? f2.state : f1.state, sel);
          };
          return compareMapped<uint8_t>(l, s1, n1, s2, n2, 8, false, special, byteMap);
        }
      }
      r = compareCase(l, f1, s1, f2, s2, n, keys.special);
      break;
    }
    case Mode::Width:
      if (!F::kShift && f1.singleByte()) {
        r = std::memcmp(s1, s2, n);  // case deliberately stays exact here
        break;
      }
      r = compareWidth(l, f1, s1, &n1, f2, s2, &n2);
      if (r) VL_TRC_AT(trc, TRC1_STATE, "Strings are unequal: len1 = %d, len2 = %d", int(n1), int(n2));
      break;
  }
  return r ? r : diff(n1, n2);
}

// W values and UTF-16 units. fold is applied to each unit when keys is given (case or
// width folded); when the language cases specially, a pair whose strings hold a key start
// (isKey(keys, unit)) before their first difference goes through map instead, and fold
// must then upper-case as map does without the table. Units after the first difference
// cannot change the sign: each maps to at least one unit, and the prefix before it maps
// alike in both strings. Terminators of negative lengths are found on the way.
// low, when given, holds for units below 256 what fold gives them with the flags of Keys;
// pairs that fold alike without a flag then cost two table reads.
template <class T, class Fold, class Map, class IsKey>
int32_t compareUnits(VLLocale *l, const T *s1, int32_t len1, const T *s2, int32_t len2, bool blanks, T blank,
                     const Keys *keys, const uint16_t *low, bool signOnly, Fold fold, Map map, IsKey isKey) {
  if (blanks || !s1 || !s2) {  // the ends are needed first
    uint32_t n1 = s1 ? resolveLen(s1, len1) : 0, n2 = s2 ? resolveLen(s2, len2) : 0;
    if (blanks) {
      while (n1 && s1[n1 - 1] == blank) --n1;
      while (n2 && s2[n2 - 1] == blank) --n2;
    }
    if (!n1 || !n2) return diff(n1, n2);
    len1 = static_cast<int32_t>(std::min<uint32_t>(n1, INT32_MAX));
    len2 = static_cast<int32_t>(std::min<uint32_t>(n2, INT32_MAX));
  }
  const bool z1 = len1 < 0, z2 = len2 < 0, special = keys && keys->special;
  const uint32_t m1 = z1 ? UINT32_MAX : static_cast<uint32_t>(len1);
  const uint32_t m2 = z2 ? UINT32_MAX : static_cast<uint32_t>(len2);
  const uint32_t n = std::min(m1, m2);
  uint32_t i = 0;
  for (; i < n; ++i) {
    const uint32_t a = s1[i], b = s2[i];
    if (low && (a | b) < 256 && low[a] == low[b] && !(low[a] & (kKey | kNul | kSlow))) continue;
    if (!(a && b) && ((!a && z1) || (!b && z2))) break;
    if (special && (isKey(*keys, a) || (a != b && isKey(*keys, b))))  // a unit may become two
      return compareMapped<T>(l, s1, z1 ? length(s1) : m1, s2, z2 ? length(s2) : m2, 2 * sizeof(T), true, true,
                              map);
    if (a == b) continue;
    if (!keys) return diff(a, b);
    const uint32_t fa = fold(a), fb = fold(b);
    if (fa != fb) return signOnly ? (fa < fb ? -1 : 1) : diff(fa, fb);
  }
  // Every unit before i is not 0 in a string measured to its 0.
  return diff(z1 ? i + length(s1 + i) : m1, z2 ? i + length(s2 + i) : m2);
}

}  // namespace vl::str
