// Stepping through encoded strings. Every walk in the library is written once over a
// "form": how a character is read and measured in one representation.
//   Bytes    plain bytes, lengths from the lead-byte table (or 1 in a single-byte page)
//   Shifted  bytes of a Shift-Out/Shift-In page; the form carries the shift state
//   Units<T> one unit per character: W values (uint32_t) or UTF-16 units
#pragma once
#include <cstdint>
#include <cstring>

#include "codepage/cpbody.h"
#include "codepage/cpprim.h"
#include "frame/frame.h"

namespace vl::step {

struct Bytes {
  using Unit = unsigned char;
  static constexpr bool kShift = false;
  static constexpr bool kUnits = false;
  const uint8_t *lenTab = nullptr;  // null: every character is one byte
  uint32_t state = 0;
  bool singleByte() const { return lenTab == nullptr; }
  bool isShift(Unit) const { return false; }
  void shift(Unit) {}
  uint32_t len(const Unit *p) const { return lenTab ? lenTab[*p] : 1u; }
};

struct Shifted {
  using Unit = unsigned char;
  static constexpr bool kShift = true;
  static constexpr bool kUnits = false;
  uint8_t so = 0, si = 0, dbl = 2;
  uint32_t state = 0;  // 0 single-byte, 1 double-byte
  bool singleByte() const { return false; }
  bool isShift(Unit b) const { return b == so || b == si; }
  void shift(Unit b) { state = b == so ? 1u : 0u; }
  uint32_t len(const Unit *) const { return state ? dbl : 1u; }
};

template <class T>
struct Units {
  using Unit = T;
  static constexpr bool kShift = false;
  static constexpr bool kUnits = true;
  uint32_t state = 0;
  bool singleByte() const { return true; }
  bool isShift(Unit) const { return false; }
  void shift(Unit) {}
  uint32_t len(const Unit *) const { return 1u; }
};
using WForm = Units<VLWChar>;
using UForm = Units<VLUChar>;

// ---- Forms of a locale -------------------------------------------------------------
// The handle to work on (null means the default); null when neither is usable.
inline VLLocale *use(VLLocale *l) {
  l = orDefault(l);
  return l && l->codePage && l->codePage->section[0] ? l : nullptr;
}
inline bool isShifted(const VLLocale *l) { return (l->flags & VL_LF_SHIFT) != 0; }
inline Bytes bytesOf(const VLLocale *l) {
  return Bytes{(l->flags & VL_LF_SINGLEBYTE) ? nullptr : cp::body(l->codePage) + cp::kLenTable, 0};
}
inline Shifted shiftedOf(const VLLocale *l, VLShiftState st) {
  const VLCodePage *c = l->codePage;
  uint8_t m = cp::maxLen(c);
  return Shifted{cp::shiftOut(c), cp::shiftIn(c), static_cast<uint8_t>(m < 1 ? 1 : m), st ? 1u : 0u};
}

inline const unsigned char *ub(const char *p) { return reinterpret_cast<const unsigned char *>(p); }
inline unsigned char *ub(char *p) { return reinterpret_cast<unsigned char *>(p); }
inline char *cb(const unsigned char *p) { return const_cast<char *>(reinterpret_cast<const char *>(p)); }
template <class T>
T *mut(const T *p) { return const_cast<T *>(p); }

// ---- Walks --------------------------------------------------------------------------
template <class F>
using U = typename F::Unit;

// Units before the terminating 0.
template <class T>
uint32_t length(const T *s) {
  if constexpr (sizeof(T) == 1) {
    return static_cast<uint32_t>(std::strlen(reinterpret_cast<const char *>(s)));
  } else {
    uint32_t n = 0;
    while (s[n]) ++n;
    return n;
  }
}

// A negative length means up to the terminating 0 (plus `extra`, to take the 0 too).
template <class T>
uint32_t resolveLen(const T *s, int32_t n, uint32_t extra = 0) {
  return n < 0 ? length(s) + extra : static_cast<uint32_t>(n);
}

// Forward walk over n units: shift bytes are passed (changing the state) and each
// call yields one whole character.
template <class F>
struct Walk {
  F f;
  const U<F> *s;
  uint32_t n;
  uint32_t pos = 0;
  // False at the end, or before a character that would run past n.
  bool next(uint32_t &at, uint32_t &len) {
    if constexpr (F::kShift)
      while (pos < n && f.isShift(s[pos])) f.shift(s[pos++]);
    if (pos >= n) return false;
    len = f.len(s + pos);
    if (len > n - pos) return false;
    at = pos;
    pos += len;
    return true;
  }
};

// Whole characters in n units.
template <class F>
uint32_t countChars(F f, const U<F> *s, uint32_t n) {
  if constexpr (!F::kShift)
    if (f.singleByte()) return n;
  Walk<F> w{f, s, n};
  uint32_t at, len, k = 0;
  while (w.next(at, len)) ++k;
  return k;
}

// Units taken by `chars` characters: a shift byte before each and one directly behind
// it count too. Reads no further than `bound` units.
template <class F>
uint32_t unitsOf(F f, const U<F> *s, uint32_t chars, uint32_t bound = UINT32_MAX) {
  if constexpr (!F::kShift)
    if (f.singleByte()) return chars;
  uint32_t pos = 0;
  for (uint32_t k = 0; k < chars && pos < bound; ++k) {
    if constexpr (F::kShift)
      if (f.isShift(s[pos])) f.shift(s[pos++]);
    if (pos >= bound) break;
    pos += f.len(s + pos);
    if constexpr (F::kShift)
      if (pos < bound && f.isShift(s[pos])) f.shift(s[pos++]);
  }
  return pos < bound ? pos : bound;
}

// Is the character c (len units) one of the characters of set?
template <class F>
bool inSet(F f, const U<F> *set, uint32_t m, const U<F> *c, uint32_t len) {
  if constexpr (F::kUnits) {
    for (uint32_t i = 0; i < m; ++i)
      if (set[i] == *c) return true;
    return false;
  } else {
    Walk<F> w{f, set, m};
    uint32_t at, l;
    while (w.next(at, l))
      if (l == len && std::memcmp(set + at, c, len) == 0) return true;
    return false;
  }
}

// Where a run stopped: the state there, and the end of its last whole character (shift
// bytes between that and the stop belong to neither).
struct SpanStop {
  uint32_t state = 0;
  uint32_t lastEnd = 0;
};

// Units of the leading run of s whose characters are (kIn) or are not (!kIn) in set.
// Shift bytes inside the run belong to it.
template <bool kIn, class F>
uint32_t span(F f, const U<F> *s, uint32_t n, F setF, const U<F> *set, uint32_t m, SpanStop *stop = nullptr) {
  if constexpr (!F::kShift && !F::kUnits) {
    if (f.singleByte()) {
      uint64_t bits[4] = {0, 0, 0, 0};
      for (uint32_t i = 0; i < m; ++i) bits[set[i] >> 6] |= uint64_t{1} << (set[i] & 63);
      uint32_t i = 0;
      while (i < n && (((bits[s[i] >> 6] >> (s[i] & 63)) & 1) != 0) == kIn) ++i;
      if (stop) *stop = SpanStop{0, i};
      return i;
    }
  }
  Walk<F> w{f, s, n};
  uint32_t at, len, lastEnd = 0;
  while (w.next(at, len)) {
    if (inSet(setF, set, m, s + at, len) != kIn) {
      if (stop) *stop = SpanStop{w.f.state, lastEnd};
      return at;
    }
    lastEnd = at + len;
  }
  if (stop) *stop = SpanStop{w.f.state, lastEnd};
  return w.pos;
}

// ---- Line ends ------------------------------------------------------------------------
constexpr uint32_t kEolKinds = VL_EOL_LF | VL_EOL_CRLF | VL_EOL_LS | VL_EOL_PS;

struct EolChars {
  uint32_t cr, lf, ls, ps;
};
inline EolChars eolOf(const VLCodePage *c) {
  const uint8_t *b = cp::body(c);
  return {b[cp::kCr], b[cp::kLf], b[cp::kLs], b[cp::kPs]};
}
constexpr EolChars kEolU = {0x0D, 0x0A, 0x2028, 0x2029};

// The first line end of the wanted kinds in s[0, n): pointer behind it, or null.
// The caller has checked the option word.
template <class F>
const U<F> *findEol(F f, const U<F> *s, uint32_t n, uint32_t kinds, EolChars e, uint32_t *kind, int32_t *eolLen,
                    uint32_t *stateOut = nullptr) {
  using T = U<F>;
  T set[4];
  uint32_t m = 0;
  if (kinds & VL_EOL_CRLF) set[m++] = static_cast<T>(e.cr);
  if (kinds & (VL_EOL_LF | VL_EOL_CRLF)) set[m++] = static_cast<T>(e.lf);
  if (kinds & VL_EOL_LS) set[m++] = static_cast<T>(e.ls);
  if (kinds & VL_EOL_PS) set[m++] = static_cast<T>(e.ps);
  F setF = f;
  setF.state = 0;
  uint32_t pos = 0;
  while (pos < n) {
    pos += span<false>(f, s + pos, n - pos, setF, set, m);
    if (pos >= n) break;
    const uint32_t c = s[pos];
    uint32_t k = 0, l = 1;
    if ((kinds & VL_EOL_CRLF) && c == e.cr && pos + 1 < n && static_cast<uint32_t>(s[pos + 1]) == e.lf)
      k = VL_EOL_CRLF, l = 2;
    else if ((kinds & VL_EOL_LF) && c == e.lf)
      k = VL_EOL_LF;
    else if ((kinds & VL_EOL_LS) && c == e.ls)
      k = VL_EOL_LS;
    else if ((kinds & VL_EOL_PS) && c == e.ps)
      k = VL_EOL_PS;
    if (k) {
      if (kind) *kind = k;
      if (eolLen) *eolLen = static_cast<int32_t>(l);
      if (stateOut) *stateOut = 0;
      return s + pos + l;
    }
    // Not a line end after all (a carriage return alone): go on past it in the
    // single-byte state, where every line-end character lives.
    ++pos;
    f.state = 0;
  }
  if (kind) *kind = VL_EOL_NOTFOUND;
  if (eolLen) *eolLen = 0;
  return nullptr;
}

// Reports a refused line-end search option word.
inline void eolRefused(VLLocale *l, uint32_t *kind, int32_t *eolLen) {
  if (kind) *kind = VL_EOL_BADOPTION;
  if (eolLen) *eolLen = 0;
  setRc(l, VL_RC_BADARG);
}

// Checks a line-end search option word; 0 means line feed. 0 when invalid.
inline uint32_t eolSearchKinds(uint32_t opts) {
  if (opts == 0) return VL_EOL_LF;
  if ((opts & kEolKinds) == kEolKinds) return kEolKinds;
  if (opts & ~kEolKinds) return 0;
  return opts;
}

// The byte forms of the line-end search: characters to bytes, the option word, the walk.
template <class F>
char *getEolBytes(VLLocale *l, F f, const char *s, int32_t length, uint32_t *kind, int32_t *eolLength,
                  uint32_t options, uint32_t *stateOut = nullptr) {
  // The bit goes whatever the length: a length of 0 or below counts nothing.
  if ((options & VL_OPT_CHARLEN) && length > 0 && s)
    length = static_cast<int32_t>(unitsOf(f, ub(s), static_cast<uint32_t>(length)));
  options &= ~VL_OPT_CHARLEN;
  uint32_t kinds = eolSearchKinds(options);
  if (!kinds) {
    eolRefused(l, kind, eolLength);
    return nullptr;
  }
  setRc(l, VL_RC_OK);
  uint32_t n = s ? resolveLen(ub(s), length) : 0;
  return cb(findEol(f, ub(s), n, kinds, eolOf(l->codePage), kind, eolLength, stateOut));
}

// Writes the line ends of the option word in the given order (the last entry stands
// for the carriage return of CRLF); a line feed follows for CRLF or the default.
template <class T>
T *writeEol(T *out, uint32_t opts, const uint32_t (&order)[4], EolChars e) {
  auto value = [&](uint32_t kind) -> uint32_t {
    switch (kind) {
      case VL_EOL_LF: return e.lf;
      case VL_EOL_LS: return e.ls;
      case VL_EOL_PS: return e.ps;
      default: return e.cr;
    }
  };
  for (uint32_t kind : order)
    if (opts & kind) *out++ = static_cast<T>(value(kind));
  if (opts & (VL_EOL_CRLF | VL_EOL_DEFAULT)) *out++ = static_cast<T>(e.lf);
  return out;
}
constexpr uint32_t kPutOrderBytes[4] = {VL_EOL_PS, VL_EOL_LS, VL_EOL_LF, VL_EOL_CRLF};
constexpr uint32_t kPutOrderUnits[4] = {VL_EOL_LF, VL_EOL_LS, VL_EOL_PS, VL_EOL_CRLF};
// Valid write option word: only bits of 0x1F00 and at least one; 0 means the default.
inline uint32_t eolPutKinds(uint32_t opts) {
  if (opts == 0) return VL_EOL_DEFAULT;
  return (opts & ~(kEolKinds | VL_EOL_DEFAULT)) ? 0 : opts;
}

// ---- Classification -------------------------------------------------------------------

// Picks the selected bits of a type word; false for an unknown selector (bits 0-9 then).
inline bool selectType(uint32_t word, uint32_t selector, uint32_t *out) {
  switch (selector) {
    case VL_CT_TYPE1: *out = word & 0x3FF; return true;
    case VL_CT_TYPE2: *out = (word >> 10) & 0xFFF; return true;
    case VL_CT_TYPE3: *out = word >> 22; return true;
    default: *out = word & 0x3FF; return false;
  }
}
// Type word of a UTF-16 unit; the stretches between the tables are uniform.
inline uint32_t unicodeType(uint32_t u) {
  if (u <= VL_UNICODE_CTYPE1_LAST) return VL_UNICODE_Ctype1[u];
  if (u < VL_UNICODE_CTYPE2_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE2_LAST) return VL_UNICODE_Ctype2[u - VL_UNICODE_CTYPE2_FIRST];
  if (u < VL_UNICODE_CTYPE3_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE3_LAST) return VL_UNICODE_Ctype3[u - VL_UNICODE_CTYPE3_FIRST];
  if (u < VL_UNICODE_CTYPE4_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE4_LAST) return VL_UNICODE_Ctype4[u - VL_UNICODE_CTYPE4_FIRST];
  if (u < VL_UNICODE_CTYPE5_FIRST) {  // mathematical operators
    if (u == 0x2212 || u == 0x2213) return 0x2008020;
    return u == 0x221E ? 0x200020 : 0x2200020;
  }
  if (u <= VL_UNICODE_CTYPE5_LAST) return VL_UNICODE_Ctype5[u - VL_UNICODE_CTYPE5_FIRST];
  if (u < VL_UNICODE_CTYPE6_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE6_LAST) return VL_UNICODE_Ctype6[u - VL_UNICODE_CTYPE6_FIRST];
  if (u < 0x4E00) return 0x400;
  if (u <= 0x9FA5) return 0x40000801;  // ideographs
  if (u < 0xAC00) return 0x400;
  if (u <= 0xD7A3) return 0x801;  // Hangul syllables
  if (u < 0xF900) return 0x400;
  if (u <= 0xFA2D) return 0x40000801;
  if (u < VL_UNICODE_CTYPE7_FIRST) return 0x400;
  if (u <= VL_UNICODE_CTYPE7_LAST) return VL_UNICODE_Ctype7[u - VL_UNICODE_CTYPE7_FIRST];
  if (u < VL_UNICODE_CTYPE8_FIRST) return u == 0xFBE9 || u == 0xFCE1 ? 0x400 : 0x1001;  // Arabic forms
  return VL_UNICODE_Ctype8[u - VL_UNICODE_CTYPE8_FIRST];
}

// Type word of a multi-byte character or W value. UTF-8 carries no type tables of its
// own: its characters are decoded and classified as Unicode.
inline uint32_t mbType(const VLCodePage *c, const uint8_t *p, unsigned n) {
  return cp::isUtf8(c) ? unicodeType(cp::utf8ToUni(p)) : cp::ctypeOf(c, p, n)->type;
}
inline uint32_t wType(const VLCodePage *c, VLWChar v) {
  return cp::isUtf8(c) ? unicodeType(cp::wToUni(c, v)) : cp::ctypeOfW(c, v)->type;
}

}  // namespace vl::step
