// Shared machinery of the conversion family: one conversion loop, instantiated over a
// source reader and a target writer.
//
// A reader frames characters (one byte, by lead-byte length, by shift state, UTF-16
// units, W values) and hands each to a decoder (to UTF-16, or to its W value). A writer
// takes the value through an encoder (from UTF-16 to bytes, to W, or W to bytes) and
// frames the result (plain, with Shift-Out/Shift-In, units, W values). Every member of
// the family, the streaming engine included, is `pump` over one such pair.
#pragma once
#include <algorithm>
#include <array>
#include <bit>
#include <cstddef>
#include <cstdint>
#include <cstring>

#include "codepage/cpprim.h"
#include "codepage/simd.h"

namespace vl::cnv {

using Value = uint32_t;
constexpr size_t kNoLimit = SIZE_MAX / 8;

enum class Got { Char, End, Partial };
enum class Stop { Done, Partial, Full };

// ---- Plain runs -----------------------------------------------------------------------
// Most text is mostly ASCII, and many pages map the first 128 (or all 256) bytes to the
// same UTF-16 values. Where both sides of a conversion agree on that, a stretch of such
// characters is a widening or narrowing copy, 16 at a time. A side reports the bound
// below which its values are plain: 0 (none), 0x80 or 0x100.

// Bytes that decode to themselves (as one-byte characters, when a length table is given).
inline unsigned plainIn(const uint8_t *sb, const uint8_t *len) {
  unsigned b = 0;
  for (; b < 0x100; ++b)
    if (rd16(sb + 2u * b) != b || (len && len[b] != 1)) break;
  return b >= 0x100 ? 0x100 : b >= 0x80 ? 0x80 : 0;
}

// Units that encode to the byte of the same value.
inline unsigned plainOut(const VLCodePage *c) {
  const uint8_t *x = cp::body(c) + cp::kIndex, *low = cp::lowTable(c);
  if (!low || x[0] > 1 || x[2] != 0) return 0;
  const uint8_t *tab = low + rd16(x + 4);
  unsigned l = 0;
  for (; l <= x[3]; ++l)
    if ((x[0] ? rd16(tab + 2u * (l & x[1])) : tab[l & x[1]]) != l) break;
  return l >= 0x100 ? 0x100 : l >= 0x80 ? 0x80 : 0;
}

// Readers of double-byte pages take ASCII runs too: in their text (Japanese, say) ASCII
// comes in runs between runs of long characters, and a run costs less than its chain of
// lead-byte lookups, each waiting for the one before. (Writers gain nothing measurable.)
template <class R>
constexpr bool asciiRuns(const R &r) {
  return requires { r.len.t; };
}

// A run of plain values, many at a time.
inline size_t plainCopy(const uint8_t *s, VLUChar *d, size_t n, unsigned lim) { return simd::widenRun(s, d, n, lim); }
inline size_t plainCopy(const VLUChar *s, uint8_t *d, size_t n, unsigned lim) { return simd::narrowRun(s, d, n, lim); }
inline size_t plainCopy(const uint8_t *s, uint8_t *d, size_t n, unsigned lim) { return simd::copy(s, d, n, lim); }

// ---- Decoders: the bytes of one character to a value ---------------------------------

// One-byte characters through the single-byte table; longer ones through the trie.
struct TrieUni {
  const uint8_t *sb, *t, *values;
  explicit TrieUni(const VLCodePage *c)
      : sb(cp::body(c) + cp::kSbcsUni), t(cp::trie(c)), values(t ? t + cp::off(c, cp::kValueOff) : nullptr) {}
  Value one(uint8_t b) const { return rd16(sb + 2u * b); }
  // The trie walk of the primitives, with the block and value addresses held.
  Value multi(const uint8_t *p, unsigned n) const {
    if (!t) return cp::kReplacement;
    const uint8_t *node = t;
    for (unsigned i = 0; i < n; ++i) {
      unsigned b = p[i];
      if (b < node[2] || b > node[3]) return cp::kReplacement;
      unsigned at = rd16(node + 4) + (b & node[1]);
      if (node[0]) return rd16(values + 2u * at);
      node = t + cp::kNodeSize * at;
    }
    return cp::kReplacement;
  }
  // multi(p, 2), unrolled.
  Value two(const uint8_t *p) const {
    const unsigned b0 = p[0], b1 = p[1];
    if (!t || t[0] || b0 < t[2] || b0 > t[3]) return multi(p, 2);
    const uint8_t *node = t + cp::kNodeSize * (rd16(t + 4) + (b0 & t[1]));
    if (!node[0] || b1 < node[2] || b1 > node[3]) return cp::kReplacement;
    return rd16(values + 2u * (rd16(node + 4) + (b1 & node[1])));
  }
};

// UTF-8 by arithmetic; one-byte characters still through the table.
struct Utf8Uni {
  const uint8_t *sb;
  explicit Utf8Uni(const VLCodePage *c) : sb(cp::body(c) + cp::kSbcsUni) {}
  Value one(uint8_t b) const { return rd16(sb + 2u * b); }
  Value multi(const uint8_t *p, unsigned) const { return cp::utf8ToUni(p); }
};

// The character's own W value.
struct RawW {
  explicit RawW(const VLCodePage *) {}
  Value one(uint8_t b) const { return b; }
  Value multi(const uint8_t *p, unsigned n) const { return cp::readW(p, n); }
};

// ---- Readers ------------------------------------------------------------------------
// safe(): characters that fast() may take without any bounds test.
// fast(): takes one character, or refuses (a shift byte) leaving the work to get().
// get(): takes one character with every test; Partial leaves it unread.
// need()/decode(): complete a character held across calls of the streaming engine.

template <class D>
struct SbReader {
  const uint8_t *p, *end;
  D d;
  uint8_t state = 0;
  SbReader(const VLCodePage *c, const uint8_t *s, size_t n, uint8_t = 0) : p(s), end(s + n), d(c) {}
  size_t safe() const { return static_cast<size_t>(end - p); }
  bool fast(Value &v) {
    v = d.one(*p++);
    return true;
  }
  Got get(Value &v) {
    if (p == end) return Got::End;
    v = d.one(*p++);
    return Got::Char;
  }
  unsigned need(uint8_t) const { return 1; }
  Value decode(const uint8_t *q, unsigned) const { return d.one(q[0]); }
  unsigned plain = ~0u;  // plainBelow, once known
  unsigned plainBelow() {
    if (plain == ~0u) {
      if constexpr (requires { d.sb; })
        plain = plainIn(d.sb, nullptr);
      else
        plain = 0;
    }
    return plain;
  }
  // The bytes that do not decode to themselves all lie in [winLo, winLo + winSpan).
  unsigned winLo = ~0u, winSpan = 0;
  // True when that window leaves ASCII out and is not empty.
  bool window() requires requires { d.sb; } {
    if (winLo == ~0u) {
      unsigned hi;
      simd::unlikeSpan(d.sb, winLo, hi);
      winSpan = hi > winLo ? hi - winLo : 0;
    }
    return winLo >= 0x80 && winSpan;
  }
};

// Length from the lead byte: the code page's table, or UTF-8 arithmetic.
struct TableLen {
  const uint8_t *t;
  explicit TableLen(const VLCodePage *c) : t(cp::body(c) + cp::kLenTable) {}
  unsigned operator()(uint8_t b) const { return t[b]; }
};
struct Utf8Len {
  explicit Utf8Len(const VLCodePage *) {}
  unsigned operator()(uint8_t b) const { return cp::utf8Len(b); }
};

template <class L, class D>
struct MbReader {
  const uint8_t *p, *end;
  L len;
  D d;
  uint8_t state = 0;
  MbReader(const VLCodePage *c, const uint8_t *s, size_t n, uint8_t = 0) : p(s), end(s + n), len(c), d(c) {}
  size_t safe() const { return static_cast<size_t>(end - p) / 4; }
  Value take(unsigned n) {
    Value v = n == 1 ? d.one(*p) : d.multi(p, n);
    p += n;
    return v;
  }
  bool fast(Value &v) {
    v = take(len(*p));
    return true;
  }
  Got get(Value &v) {
    if (p == end) return Got::End;
    unsigned n = len(*p);
    if (n > static_cast<size_t>(end - p)) return Got::Partial;
    v = take(n);
    return Got::Char;
  }
  unsigned need(uint8_t lead) const { return len(lead); }
  Value decode(const uint8_t *q, unsigned n) const { return n == 1 ? d.one(q[0]) : d.multi(q, n); }
  // Lead bytes of long characters as ranges, for framing a block at a time: -1 until
  // known, then 0 when there are none or too many.
  int framed = -1;
  simd::LeadRanges leads;
  bool frames() requires requires { len.t; } {
    if (framed < 0) framed = leads.build(len.t) && leads.count;
    return framed != 0;
  }
  unsigned plain = ~0u;
  unsigned plainBelow() {
    if (plain == ~0u) {
      if constexpr (!requires { d.sb; })
        plain = 0;
      else if constexpr (requires { len.t; })
        plain = plainIn(d.sb, len.t);
      else
        plain = std::min(plainIn(d.sb, nullptr), 0x80u);
    }
    return plain;
  }
};

// Shift-Out/Shift-In runs: maximum-length characters in state 1, single bytes in state 0.
template <class D>
struct ShiftReader {
  const uint8_t *p, *end;
  D d;
  uint8_t state;
  uint8_t so, si;
  unsigned wide;
  ShiftReader(const VLCodePage *c, const uint8_t *s, size_t n, uint8_t st)
      : p(s), end(s + n), d(c), state(st ? 1 : 0), so(cp::shiftOut(c)), si(cp::shiftIn(c)), wide(cp::maxLen(c)) {}
  size_t safe() const { return static_cast<size_t>(end - p) / wide; }
  bool fast(Value &v) {
    uint8_t b = *p;
    if (b == so || b == si) return false;
    if (state) {
      v = d.multi(p, wide);
      p += wide;
    } else {
      v = d.one(b);
      ++p;
    }
    return true;
  }
  Got get(Value &v) {
    for (;;) {
      if (p == end) return Got::End;
      if (*p == so)
        state = 1;
      else if (*p == si)
        state = 0;
      else
        break;
      ++p;
    }
    unsigned n = state ? wide : 1;
    if (n > static_cast<size_t>(end - p)) return Got::Partial;
    v = n == 1 ? d.one(*p) : d.multi(p, n);
    p += n;
    return Got::Char;
  }
  unsigned need(uint8_t) const { return state ? wide : 1; }
  unsigned plainBelow() const { return 0; }
  Value decode(const uint8_t *q, unsigned n) const { return n == 1 ? d.one(q[0]) : d.multi(q, n); }
};

struct U16Reader {
  const VLUChar *p, *end;
  uint8_t state = 0;
  U16Reader(const VLUChar *s, size_t n) : p(s), end(s + n) {}
  unsigned plainBelow() const { return 0x10000; }
  size_t safe() const { return static_cast<size_t>(end - p); }
  bool fast(Value &v) {
    v = *p++;
    return true;
  }
  Got get(Value &v) {
    if (p == end) return Got::End;
    v = *p++;
    return Got::Char;
  }
};

// W values, to UTF-16 (one-byte values through the single-byte table) or as they are.
struct WUni {
  const VLCodePage *cp;
  const uint8_t *sb;
  explicit WUni(const VLCodePage *c) : cp(c), sb(cp::body(c) + cp::kSbcsUni) {}
  Value operator()(VLWChar w) const { return w > 0xFF ? cp::wToUni(cp, w) : rd16(sb + 2u * w); }
};
struct WSame {
  explicit WSame(const VLCodePage *) {}
  Value operator()(VLWChar w) const { return w; }
};

template <class D>
struct WReader {
  const VLWChar *p, *end;
  D d;
  uint8_t state = 0;
  WReader(const VLCodePage *c, const VLWChar *s, size_t n) : p(s), end(s + n), d(c) {}
  size_t safe() const { return static_cast<size_t>(end - p); }
  bool fast(Value &v) {
    v = d(*p++);
    return true;
  }
  Got get(Value &v) {
    if (p == end) return Got::End;
    v = d(*p++);
    return Got::Char;
  }
};

// ---- Encoders: a value to the bytes of one character ---------------------------------
// kMax: the most bytes one value gives.

// The third bytes of blocks that have none.
inline constexpr uint8_t kNoThird[256] = {};

// A single-byte, shift-sensitive or EUC target: the index entry of the last high byte is
// kept with its bounds, so a run in one block of 256 units is a compare and a table load
// per unit. Every caller gives kMax bytes of room; none past the character changes.
// kThirds: for pages with characters of three bytes, where blocks of one- and two-byte
// values mix with blocks that have a third byte, all of them go the branch-free way; other
// pages keep a branch on the length, which their runs predict.
template <bool kThirds>
struct IndexEncT {
  static constexpr unsigned kMax = 4;
  const VLCodePage *cp;
  const uint8_t *index, *low;
  const uint8_t *entry = nullptr;
  const uint8_t *tab = nullptr, *htab = nullptr;
  unsigned high = 0x100, lo = 1, hi = 0, mask = 0;
  uint8_t kind = 0xFF;
  uint8_t sub;
  explicit IndexEncT(const VLCodePage *c)
      : cp(c), index(cp::body(c) + cp::kIndex), low(cp::lowTable(c)), sub(cp::subst(c)) {}
  void load(unsigned h) {
    high = h;
    entry = index + cp::kIndexSize * h;
    lo = entry[2];
    hi = entry[3];
    mask = entry[1];
    kind = entry[0];
    tab = low ? low + rd16(entry + 4) : nullptr;
    if (!tab) lo = 1, hi = 0;
    // Blocks of kind 2 have their high table: the load-time check proved it.
    if constexpr (kThirds)
      htab = kind == 2 ? cp::highTable(cp) + rd16(entry + 6) : kNoThird;
    else
      htab = cp::highTable(cp) ? cp::highTable(cp) + rd16(entry + 6) : nullptr;
  }
  [[gnu::always_inline]] unsigned operator()(Value u, uint8_t *out) {
    unsigned h = (u >> 8) & 0xFF, l = u & 0xFF;
    if (h != high) load(h);
    if (l < lo || l > hi) {
      out[0] = sub;
      return 1;
    }
    if (kind == 0) {
      out[0] = tab[l & mask];
      return 1;
    }
    if constexpr (kThirds) {
      if (kind == 1 || kind == 2) return third(u, l & mask, out);
    } else {
      if (kind == 1) {
        unsigned v = rd16(tab + 2u * (l & mask));
        if (v > 0xFF) {
          out[0] = static_cast<uint8_t>(v >> 8);
          out[1] = static_cast<uint8_t>(v);
          return 2;
        }
        out[0] = static_cast<uint8_t>(v);
        return 1;
      }
      if (kind == 2) return third(u, l & mask, out);
    }
    return wide(u, out);
  }
  // Blocks with a third byte: two and three bytes without a branch between them (in
  // Japanese text they alternate at random), and none past them.
  [[gnu::always_inline]] unsigned third(Value u, unsigned i, uint8_t *out) const {
    unsigned v = rd16(tab + 2u * i), t = htab[i];
    if (v <= 0xFF) {
      if (t) return wide(u, out);  // a zero byte inside: dropped, as ever
      out[0] = static_cast<uint8_t>(v);
      return 1;
    }
    // The third byte, then the other two behind it: over it when there is none.
    const bool lead = t != 0;
    out[0] = static_cast<uint8_t>(t);
    const auto w = static_cast<uint16_t>(std::endian::native == std::endian::little ? __builtin_bswap16(static_cast<uint16_t>(v)) : v);
    std::memcpy(out + lead, &w, 2);
    return 2u + lead;
  }
  // Characters of three or four bytes: the primitives' own reading of the entry.
  [[gnu::noinline]] unsigned wide(Value u, uint8_t *out) const {
    return static_cast<unsigned>(cp::wToMb(out, cp::indexValue(cp, entry, static_cast<VLUChar>(u))));
  }
};


using IndexEnc = IndexEncT<false>;

// A double-byte target. Each unit reads its own block's index entry: in Japanese text the
// block changes at nearly every character, where keeping the last entry cost a
// mispredicted branch and a reload. Blocks of 16-bit values write one or two bytes without
// a branch between them (the lengths alternate at random too): two bytes are stored, the
// second as it was when the character has one.
struct DirectEnc {
  static constexpr unsigned kMax = 4;
  const VLCodePage *cp;
  const uint8_t *index, *low;
  uint8_t sub;
  // Without the low table every unit is out of bounds: an index of empty blocks says so.
  static constexpr auto kEmpty = [] {
    std::array<uint8_t, 256 * cp::kIndexSize> x{};
    for (size_t h = 0; h < 256; ++h) x[h * cp::kIndexSize + 2] = 1;
    return x;
  }();
  explicit DirectEnc(const VLCodePage *c)
      : cp(c), index(cp::lowTable(c) ? cp::body(c) + cp::kIndex : kEmpty.data()), low(cp::lowTable(c)),
        sub(cp::subst(c)) {}
  // The entry's fields from one load: kind, mask, bounds, then the low table offset.
  struct Entry {
    unsigned kind, mask, lo, hi, lowAt;
    explicit Entry(const uint8_t *e) {
      uint64_t w;
      std::memcpy(&w, e, 8);
      if constexpr (std::endian::native == std::endian::little) {
        kind = w & 0xFF, mask = (w >> 8) & 0xFF, lo = (w >> 16) & 0xFF, hi = (w >> 24) & 0xFF;
        lowAt = (w >> 32) & 0xFFFF;
      } else {
        kind = static_cast<unsigned>(w >> 56), mask = (w >> 48) & 0xFF, lo = (w >> 40) & 0xFF, hi = (w >> 32) & 0xFF;
        lowAt = (w >> 16) & 0xFFFF;
      }
    }
  };
  [[gnu::always_inline]] unsigned operator()(Value u, uint8_t *out) const {
    const uint8_t *e = index + cp::kIndexSize * ((u >> 8) & 0xFF);
    const Entry x(e);
    const unsigned l = u & 0xFF;
    if (l < x.lo || l > x.hi) {
      out[0] = sub;
      return 1;
    }
    const uint8_t *tab = low + x.lowAt;
    const unsigned i = l & x.mask;
    if (x.kind == 1) {
      // One byte keeps the byte behind it as it was (the caller's, or what the next
      // character overwrites), so nothing changes past the output.
      const unsigned v = rd16(tab + 2u * i), behind = out[1];
      const bool two = v > 0xFF;
      constexpr bool little = std::endian::native == std::endian::little;
      const auto w = static_cast<uint16_t>(little ? (two ? __builtin_bswap16(static_cast<uint16_t>(v)) : v | behind << 8)
                                                  : (two ? v : v << 8 | behind));
      std::memcpy(out, &w, 2);
      return 1u + two;
    }
    if (x.kind == 0) {
      out[0] = tab[i];
      return 1;
    }
    return wide(e, u, out);
  }
  // The primitives' own reading of the entry, for the other kinds.
  [[gnu::noinline]] unsigned wide(const uint8_t *e, Value u, uint8_t *out) const {
    return static_cast<unsigned>(cp::wToMb(out, cp::indexValue(cp, e, static_cast<VLUChar>(u))));
  }
};

struct Utf8Enc {
  static constexpr unsigned kMax = 3;
  explicit Utf8Enc(const VLCodePage *) {}
  unsigned operator()(Value u, uint8_t *out) const {
    if (u < 0x80) {
      out[0] = static_cast<uint8_t>(u);
      return 1;
    }
    return static_cast<unsigned>(cp::uniToUtf8(static_cast<VLUChar>(u), out));
  }
};

// W values written as their bytes; a single-byte page takes the low byte of each.
struct RawEnc {
  static constexpr unsigned kMax = 4;
  explicit RawEnc(const VLCodePage *) {}
  unsigned operator()(Value w, uint8_t *out) const { return static_cast<unsigned>(cp::wToMb(out, w)); }
};
struct RawSbEnc {
  static constexpr unsigned kMax = 1;
  explicit RawSbEnc(const VLCodePage *) {}
  unsigned operator()(Value w, uint8_t *out) const {
    out[0] = static_cast<uint8_t>(w);
    return 1;
  }
};

// ---- Writers --------------------------------------------------------------------------
// safe(): values that fast() may write without a room test. put(): writes one value only
// if it fits whole. spill(): encodes one value (shift byte included) into buf for the
// streaming engine, committing the shift state.

template <class E>
struct ByteWriter {
  uint8_t *start, *o, *end;
  E enc;
  uint8_t state = 0;
  ByteWriter(const VLCodePage *c, uint8_t *s, size_t n, uint8_t = 0) : start(s), o(s), end(s + n), enc(c) {}
  unsigned plain = ~0u;
  unsigned plainBelow() {
    if (plain == ~0u) {
      if constexpr (requires { enc.cp; })
        plain = plainOut(enc.cp);
      else if constexpr (E::kMax == 3)
        plain = 0x80;  // UTF-8
      else
        plain = 0;
    }
    return plain;
  }
  size_t safe() const { return static_cast<size_t>(end - o) / E::kMax; }
  [[gnu::always_inline]] void fast(Value v) { o += enc(v, o); }
  bool put(Value v) {
    uint8_t b[8] = {};
    unsigned n = enc(v, b);
    if (n > static_cast<size_t>(end - o)) return false;
    std::memcpy(o, b, n);
    o += n;
    return true;
  }
  unsigned spill(Value v, uint8_t *buf) { return enc(v, buf); }
};

template <class E>
struct ShiftWriter {
  uint8_t *start, *o, *end;
  E enc;
  uint8_t state;
  uint8_t so, si;
  ShiftWriter(const VLCodePage *c, uint8_t *s, size_t n, uint8_t st)
      : start(s), o(s), end(s + n), enc(c), state(st ? 1 : 0), so(cp::shiftOut(c)), si(cp::shiftIn(c)) {}
  size_t safe() const { return static_cast<size_t>(end - o) / (E::kMax + 1); }
  unsigned plainBelow() const { return 0; }
  // The character's bytes behind the shift byte it needs, if any.
  unsigned form(Value v, uint8_t *b) {
    unsigned n = enc(v, b + 1);
    uint8_t want = n > 1 ? 1 : 0;
    if (want == state) return n;
    b[0] = want ? so : si;
    return n + 1 + 0x100;  // the 0x100 marks a state change
  }
  void fast(Value v) {
    uint8_t b[8];
    unsigned n = form(v, b);
    if (n & 0x100) {
      state ^= 1;
      n &= 0xFF;
      std::memcpy(o, b, n);
    } else {
      std::memcpy(o, b + 1, n);
    }
    o += n;
  }
  bool put(Value v) {
    uint8_t b[8];
    unsigned n = form(v, b);
    bool change = (n & 0x100) != 0;
    n &= 0xFF;
    if (n > static_cast<size_t>(end - o)) return false;
    std::memcpy(o, change ? b : b + 1, n);
    o += n;
    if (change) state ^= 1;
    return true;
  }
  unsigned spill(Value v, uint8_t *buf) {
    uint8_t b[8];
    unsigned n = form(v, b);
    bool change = (n & 0x100) != 0;
    n &= 0xFF;
    std::memcpy(buf, change ? b : b + 1, n);
    if (change) state ^= 1;
    return n;
  }
};

struct U16Writer {
  VLUChar *start, *o, *end;
  uint8_t state = 0;
  U16Writer(VLUChar *s, size_t n) : start(s), o(s), end(s + n) {}
  unsigned plainBelow() const { return 0x10000; }
  size_t safe() const { return static_cast<size_t>(end - o); }
  void fast(Value v) { *o++ = static_cast<VLUChar>(v); }
  bool put(Value v) {
    if (o == end) return false;
    *o++ = static_cast<VLUChar>(v);
    return true;
  }
};

// UTF-16 units to W values of the code page, or W values as they are.
struct UniW {
  const VLCodePage *cp;
  explicit UniW(const VLCodePage *c) : cp(c) {}
  VLWChar operator()(Value u) const { return cp::uniToW(cp, static_cast<VLUChar>(u)); }
};
struct SameW {
  explicit SameW(const VLCodePage *) {}
  VLWChar operator()(Value w) const { return w; }
};

template <class E>
struct WWriter {
  VLWChar *start, *o, *end;
  E enc;
  uint8_t state = 0;
  WWriter(const VLCodePage *c, VLWChar *s, size_t n) : start(s), o(s), end(s + n), enc(c) {}
  size_t safe() const { return static_cast<size_t>(end - o); }
  void fast(Value v) { *o++ = enc(v); }
  bool put(Value v) {
    if (o == end) return false;
    *o++ = enc(v);
    return true;
  }
};

// ---- Blocks of mixed text -------------------------------------------------------------
// Pairs with a block loop convert many characters a step (simd.h) and leave what a step
// does not take to the character loop. blocksOn says once per call whether the pages
// allow it.

// Single-byte pages. Where ASCII decodes to itself, widen and patch the bytes of the
// window from the table (in Western pages a few control positions, or the upper half);
// elsewhere (EBCDIC) table shuffles, or eight table loads a step.
template <class D>
inline bool blocksOn(SbReader<D> &r, U16Writer &) requires requires { r.d.sb; } {
  r.window();
  return r.winSpan != 0;
}
template <class D>
inline size_t blocks(SbReader<D> &r, U16Writer &w, size_t n) requires requires { r.d.sb; } {
  size_t i = 0;
  if (r.window()) {
    const auto lo = static_cast<uint8_t>(r.winLo), span = static_cast<uint8_t>(r.winSpan);
    for (; i + 16 <= n; i += 16)
      for (unsigned m = simd::widenBlock(r.p + i, w.o + i, lo, span); m; m &= m - 1) {
        unsigned j = static_cast<unsigned>(__builtin_ctz(m));
        w.o[i + j] = static_cast<VLUChar>(r.d.one(r.p[i + j]));
      }
  } else {
    const uint8_t *p = r.p;
    VLUChar *o = w.o;
    const D d = r.d;
    i = simd::mapBytes(p, o, n, d.sb);
    for (; i + 8 <= n; i += 8)
      for (unsigned j = 0; j < 8; ++j) o[i + j] = static_cast<VLUChar>(d.one(p[i + j]));
  }
  r.p += i;
  w.o += i;
  return i;
}

// To a single-byte page. Where ASCII is plain but not all of 0x00-0xFF, narrow and patch
// the other units through the encoder; where the page's first index block is a full table
// (EBCDIC), units below 0x100 take a load each, eight a step. A unit that takes more than
// one byte ends the step.
inline const uint8_t *firstBlock(const IndexEnc &e) {
  const uint8_t *x = e.index;
  if (!e.low || x[0] != 0 || x[1] != 0xFF || x[2] != 0 || x[3] != 0xFF) return nullptr;
  return e.low + rd16(x + 4);
}
inline bool blocksOn(U16Reader &, ByteWriter<IndexEnc> &w) {
  return cp::maxLen(w.enc.cp) == 1 && (w.plainBelow() == 0x80 || (w.plainBelow() == 0 && firstBlock(w.enc)));
}
inline size_t blocks(U16Reader &r, ByteWriter<IndexEnc> &w, size_t n) {
  const VLUChar *u = r.p;
  uint8_t *o = w.o;
  // Through the encoder: false when the unit takes more than one byte.
  auto one = [&](size_t at) {
    uint8_t b[IndexEnc::kMax];
    if (w.enc(u[at], b) != 1) return false;
    o[at] = b[0];
    return true;
  };
  auto steps = [&]() -> size_t {
    size_t i = 0;
    if (w.plainBelow() == 0x80) {
      for (; i + 16 <= n; i += 16)
        for (unsigned m = simd::narrowBlock(u + i, o + i, 0x80); m; m &= m - 1)
          if (unsigned j = static_cast<unsigned>(__builtin_ctz(m)); !one(i + j)) return i + j;
      return i;
    }
    const uint8_t *tab = firstBlock(w.enc);
    for (; i + 8 <= n; i += 8) {
      if ((u[i] | u[i + 1] | u[i + 2] | u[i + 3] | u[i + 4] | u[i + 5] | u[i + 6] | u[i + 7]) < 0x100) {
        // One store for the eight: the loop stays on loads.
        constexpr bool little = std::endian::native == std::endian::little;
        uint64_t v = 0;
        for (unsigned j = 0; j < 8; ++j) v |= uint64_t{tab[u[i + j]]} << (little ? 8 * j : 56 - 8 * j);
        std::memcpy(o + i, &v, 8);
        continue;
      }
      for (unsigned j = 0; j < 8; ++j)
        if (!one(i + j)) return i + j;
    }
    return i;
  };
  size_t i = steps();
  r.p += i;
  w.o += i;
  return i;
}

// Pages whose characters take up to three bytes by a length table. A block of 64 bytes is
// framed from the masks of its leads, with no chain of lead-byte lookups: a two-byte lead
// takes the byte after it, unless it is itself taken (runs of leads alternate), as the
// character loop frames them from the block's first byte. A three-byte lead is framed
// as one byte followed by a two-byte character, which holds for every lead whose next
// byte leads two bytes; any other, a longer lead, or a character crossing the block's
// end ends the step before it.
inline uint64_t secondBytes(uint64_t leads) {
  constexpr uint64_t even = 0x5555555555555555u;
  const uint64_t follows = leads << 1;
  const uint64_t oddStarts = leads & ~even & ~follows;
  const uint64_t evenRuns = oddStarts + leads;  // runs of leads starting at odd bits now start at even ones
  return (even ^ (evenRuns << 1)) & follows;
}
template <class D>
inline bool blocksOn(MbReader<TableLen, D> &r, U16Writer &) requires requires { r.d.t; } {
  return r.frames();
}
// kPop: the processor counts bits in one instruction, so a character's rank among the
// block's is counted where it is written; otherwise a pass over the block notes each.
template <bool kPop, class D>
[[gnu::always_inline]] inline size_t framedBlocks(MbReader<TableLen, D> &r, U16Writer &w, size_t n) {
  size_t done = 0;
  const D d = r.d;
  const uint8_t *lens = r.len.t;
  while (n - done >= 64) {
    const uint8_t *p = r.p;
    const simd::LeadMasks m = simd::leadMasks(p, r.leads, lens);
    const uint64_t starts = ~secondBytes(m.two);
    const uint64_t three = m.three & starts;
    constexpr uint64_t top = uint64_t{1} << 63, two = uint64_t{3} << 62;
    // A character that ends past the block starts the next one; one the framing cannot
    // take ends the step.
    const uint64_t stop = (m.longer & starts) | (three & ~(m.two >> 1)) | (three & two) | (m.two & starts & top);
    const unsigned end = stop ? static_cast<unsigned>(__builtin_ctzll(stop)) : 64;
    if (!end) break;
    const uint64_t take = (end == 64 ? ~uint64_t{0} : (uint64_t{1} << end) - 1) & starts & ~(three << 1);
    // One loop per length, each character written at its rank among the block's: the
    // loops branch only on their ends, wherever the lengths change.
    VLUChar *o = w.o;
    uint8_t ranks[64];
    if constexpr (!kPop) {
      unsigned k = 0;
      for (uint64_t x = take; x; x &= x - 1) ranks[__builtin_ctzll(x)] = static_cast<uint8_t>(k++);
    }
    const auto rank = [&](unsigned at) -> unsigned {
      if constexpr (kPop)
        return static_cast<unsigned>(__builtin_popcountll(take & ((uint64_t{1} << at) - 1)));
      else
        return ranks[at];
    };
    for (uint64_t x = take & ~m.two & ~three; x; x &= x - 1) {
      const auto at = static_cast<unsigned>(__builtin_ctzll(x));
      o[rank(at)] = static_cast<VLUChar>(d.one(p[at]));
    }
    for (uint64_t x = take & m.two; x; x &= x - 1) {
      const auto at = static_cast<unsigned>(__builtin_ctzll(x));
      o[rank(at)] = static_cast<VLUChar>(d.two(p + at));
    }
    for (uint64_t x = take & three; x; x &= x - 1) {
      const auto at = static_cast<unsigned>(__builtin_ctzll(x));
      o[rank(at)] = static_cast<VLUChar>(d.multi(p + at, 3));
    }
    size_t count;
    if constexpr (kPop)
      count = static_cast<size_t>(__builtin_popcountll(take));
    else
      count = ranks[63 - __builtin_clzll(take)] + size_t{1};
    done += count;
    w.o = o + count;
    r.p += end;
  }
  return done;
}
#ifdef __x86_64__
template <class D>
[[gnu::target("popcnt")]] size_t framedBlocksPop(MbReader<TableLen, D> &r, U16Writer &w, size_t n) {
  return framedBlocks<true>(r, w, n);
}
#endif
// The scalar level leaves every character to the character loop, which the tests hold the
// framing against.
template <class D>
inline size_t blocks(MbReader<TableLen, D> &r, U16Writer &w, size_t n) requires requires { r.d.t; } {
#ifdef __x86_64__
  if (simd::level() == simd::kAvx2) return framedBlocksPop(r, w, n);  // every AVX2 processor counts bits
#endif
  return simd::level() == simd::kScalar ? 0 : framedBlocks<false>(r, w, n);
}

// UTF-8 and UTF-16 both ways, where the page's ASCII is plain.
inline bool blocksOn(MbReader<Utf8Len, Utf8Uni> &r, U16Writer &) { return r.plainBelow() >= 0x80; }
inline size_t blocks(MbReader<Utf8Len, Utf8Uni> &r, U16Writer &w, size_t n) {
  simd::Moved m = simd::utf8ToUtf16(r.p, w.o, n);
  r.p += m.in;
  w.o += m.out;
  return m.out;
}
inline bool blocksOn(U16Reader &, ByteWriter<Utf8Enc> &) { return true; }
inline size_t blocks(U16Reader &r, ByteWriter<Utf8Enc> &w, size_t n) {
  simd::Moved m = simd::utf16ToUtf8(r.p, w.o, n);
  r.p += m.in;
  w.o += m.out;
  return m.in;
}

// ---- The loop -----------------------------------------------------------------------
// Converts until the input ends (Done), a character is cut short (Partial, left unread)
// or the output or the character limit is reached (Full: the character read is in held).
// Whole runs go through fast(); the tests happen once per run.
template <class R, class W>
inline Stop pump(R &r, W &w, size_t &chars, size_t maxChars, Value &held) {
  for (;;) {
    size_t n = std::min(std::min(r.safe(), w.safe()), maxChars - chars);
    if (n) {
      // Local copies keep the positions in registers through the run.
      R lr = r;
      W lw = w;
      size_t i = 0;
      unsigned lim = 0;
      bool blocked = false;
      if constexpr (requires { blocks(lr, lw, n); }) {
        if (n >= 32 && blocksOn(lr, lw)) {
          blocked = true;
          while (i < n) {
            i += blocks(lr, lw, n - i);
            // Where a step stopped, a stretch one by one, then steps again.
            size_t m = std::min<size_t>(n - i, 16);
            for (size_t j = 0; j < m; ++j) {
              Value v;
              (void)lr.fast(v);  // these readers never refuse
              lw.fast(v);
            }
            i += m;
          }
        }
      }
      if constexpr (requires { plainCopy(lr.p, lw.o, n, 0u); }) {
        if (n >= 32 && !blocked) lim = std::min(lr.plainBelow(), lw.plainBelow());
        // Runs pay where every byte is plain and in double-byte sources: in other pages the
        // runs of real text are shorter than a block, and the table loop below is faster.
        if (lim < 0x100 && !asciiRuns(lr)) lim = 0;
        if (lim >= 0x80) {
          lim = lim >= 0x100 ? 0x100 : 0x80;
          while (i < n) {
            size_t k = plainCopy(lr.p, lw.o, n - i, lim);
            lr.p += k;
            lw.o += k;
            i += k;
            // The run ended at a value that is not plain: convert one by one until a plain
            // value starts the next run (peeking only while another character is safe).
            // After a run shorter than a block, a stretch goes one by one first: a table
            // load per character costs less than starting runs that end at once.
            size_t m = n - i, j = 0, least = k < 16 ? std::min<size_t>(m, 24) : 0;
            bool refused = false;
            for (; j < least && !refused; ++j) {
              Value v;
              if (!lr.fast(v)) {
                refused = true;
                break;
              }
              lw.fast(v);
            }
            while (!refused && j < m) {
              Value v;
              if (!lr.fast(v)) {
                refused = true;
                break;
              }
              lw.fast(v);
              if (++j < m && *lr.p < lim) break;
            }
            i += j;
            if (refused) break;
          }
        }
      }
      if (lim < 0x80) {
        for (; i < n; ++i) {
          Value v;
          if (!lr.fast(v)) break;
          lw.fast(v);
        }
      }
      r = lr;
      w = lw;
      chars += i;
    }
    Value v;
    switch (r.get(v)) {
      case Got::End:
        return Stop::Done;
      case Got::Partial:
        return Stop::Partial;
      case Got::Char:
        break;
    }
    if (chars >= maxChars || !w.put(v)) {
      held = v;
      return Stop::Full;
    }
    ++chars;
  }
}

// ---- Choosing the pair ------------------------------------------------------------------

// A byte source: single-byte by the locale flag, shift runs only where the caller keeps a
// state (Ex members and the engine), UTF-8 by arithmetic, else the lead-byte table.
template <class D8, class DT, class F>
inline auto withByteReader(const VLLocale *l, bool shiftAware, const uint8_t *s, size_t n, uint8_t state, F &&f) {
  const VLCodePage *c = l->codePage;
  if (l->flags & VL_LF_SINGLEBYTE) {
    SbReader<DT> r(c, s, n);
    return f(r);
  }
  if (shiftAware && cp::isShift(c)) {
    ShiftReader<DT> r(c, s, n, state);
    return f(r);
  }
  if (cp::isUtf8(c)) {
    MbReader<Utf8Len, D8> r(c, s, n);
    return f(r);
  }
  MbReader<TableLen, DT> r(c, s, n);
  return f(r);
}

template <class F>
inline auto withUniReader(const VLLocale *l, bool shiftAware, const uint8_t *s, size_t n, uint8_t state, F &&f) {
  return withByteReader<Utf8Uni, TrieUni>(l, shiftAware, s, n, state, static_cast<F &&>(f));
}

template <class F>
inline auto withByteWriter(const VLCodePage *c, bool shiftAware, uint8_t *o, size_t n, uint8_t state, F &&f) {
  if (shiftAware && cp::isShift(c)) {
    ShiftWriter<IndexEnc> w(c, o, n, state);
    return f(w);
  }
  if (cp::isUtf8(c)) {
    ByteWriter<Utf8Enc> w(c, o, n);
    return f(w);
  }
  if (cp::maxLen(c) >= 3) {
    ByteWriter<IndexEncT<true>> w(c, o, n);
    return f(w);
  }
  if (cp::maxLen(c) == 2) {
    ByteWriter<DirectEnc> w(c, o, n);
    return f(w);
  }
  ByteWriter<IndexEnc> w(c, o, n);
  return f(w);
}

// ---- Shared rules of the string members --------------------------------------------------

inline bool usable(const VLLocale *l) { return l && cp::usable(l->codePage); }

// Option words: 0 or VL_OPT_NULLTERM, each with or without VL_OPT_CHARLEN.
inline bool stdOptions(uint32_t o) { return (o & ~(VL_OPT_NULLTERM | VL_OPT_CHARLEN)) == 0; }

template <class T>
inline size_t strLen(const T *s) {
  size_t n = 0;
  while (s[n]) ++n;
  return n;
}

// Bytes taken by the first `chars` characters, for input lengths counted in characters.
// The caller vouches that they exist.
inline size_t bytesOfChars(const VLLocale *l, bool shiftAware, const uint8_t *s, uint8_t state, size_t chars) {
  const VLCodePage *c = l->codePage;
  if (l->flags & VL_LF_SINGLEBYTE) return chars;
  size_t at = 0;
  if (shiftAware && cp::isShift(c)) {
    uint8_t so = cp::shiftOut(c), si = cp::shiftIn(c);
    unsigned wide = cp::maxLen(c);
    for (size_t k = 0; k < chars; ++k) {
      for (;; ++at) {
        if (s[at] == so)
          state = 1;
        else if (s[at] == si)
          state = 0;
        else
          break;
      }
      at += state ? wide : 1;
    }
    return at;
  }
  for (size_t k = 0; k < chars; ++k) at += cp::lenOf(c, s[at]);
  return at;
}

// ---- The string members ---------------------------------------------------------------

// How a string member was asked to end its output.
struct Shape {
  int32_t size;    // output size in units (characters with charLen)
  bool nullTerm;   // VL_OPT_NULLTERM: reserve, write and count a 0
  bool charLen;    // output size and result count characters
  bool negIn;      // the input ran to its 0: append one when all fits
  bool empty;      // nothing to convert
  unsigned perChar;  // most output units one character takes
};

// takeBack: the 0 was asked for, so the last double-byte character gives way to it;
// otherwise a 0 that does not fit is simply not written.
template <class W>
inline bool terminate(W &w, decltype(W::o) limit, size_t &chars, bool countChars, const VLCodePage *c,
                      bool takeBack) {
  if constexpr (requires { w.so; }) {
    // An open double-byte run is closed first; without room for Shift-In and the 0 the
    // last double-byte character gives way.
    if (w.state == 1) {
      unsigned wide = cp::maxLen(c);
      if (limit - w.o < 2) {
        if (!takeBack || static_cast<size_t>(w.o - w.start) < wide) return false;
        w.o -= wide;
        if (countChars && chars) --chars;
      }
      if (w.o > w.start && w.o[-1] == w.so)
        --w.o;
      else
        *w.o++ = w.si;
      w.state = 0;
    }
  }
  (void)c;
  (void)countChars;
  (void)takeBack;
  if (w.o >= limit) return false;
  *w.o++ = 0;
  return true;
}

// Runs reader r into the writer that make(room, body) builds, and ends the output by the
// shape's rules. Returns the count of units (characters with charLen) written.
template <class R, class Make>
inline int32_t drive(R &r, Make &&make, const Shape &s, const VLCodePage *target) {
  if (s.size <= 0) return 0;
  size_t size = static_cast<size_t>(s.size);
  if (s.empty) {
    if (!s.nullTerm) return 0;
    return make(size, [&](auto &w) -> int32_t {
      if constexpr (requires { w.so; })
        if (w.state == 1 && size >= 2) *w.o++ = w.si;
      *w.o++ = 0;
      return 1;
    });
  }
  size_t room = size - (s.nullTerm ? 1 : 0);
  size_t maxChars = s.charLen ? room : kNoLimit;
  size_t units = s.charLen ? std::min(room * s.perChar, kNoLimit) : room;
  return make(units, [&](auto &w) -> int32_t {
    size_t chars = 0;
    Value held = 0;
    Stop st = pump(r, w, chars, maxChars, held);
    bool wrote = false;
    if (s.nullTerm)
      wrote = terminate(w, w.end + 1, chars, s.charLen, target, true);
    else if (s.negIn && st == Stop::Done && chars < maxChars)
      wrote = terminate(w, w.end, chars, s.charLen, target, false);
    size_t n = s.charLen ? chars + (s.nullTerm && wrote ? 1 : 0)
                         : static_cast<size_t>(w.o - w.start) - (wrote && !s.nullTerm ? 1 : 0);
    return static_cast<int32_t>(n);
  });
}


// ---- Family members that share a body ------------------------------------------------

// W-form members take 0 or VL_OPT_NULLTERM; VL_OPT_CHARLEN is let through and ignored.
inline bool wOptions(uint32_t o) { return stdOptions(o); }

inline bool badArgs(const VLLocale *l, int32_t size, const void *out, int32_t len, const void *in) {
  return !usable(l) || (size > 0 && !out) || (len != 0 && !in);
}

// Length of a byte input: to its 0 when negative, else counted in characters or bytes.
inline size_t byteInput(const VLLocale *l, bool ex, const uint8_t *s, uint8_t state, int32_t len, bool charLen) {
  if (len < 0) return strLen(s);
  if (charLen) return bytesOfChars(l, ex, s, state, static_cast<size_t>(len));
  return static_cast<size_t>(len);
}

inline uint8_t stateOf(VLShiftState s) { return s == 1 ? 1 : 0; }

inline int32_t convertString(VLLocale *target, char *out, VLShiftState ts, int32_t size, VLLocale *source,
                             const char *in, VLShiftState ss, int32_t len, uint32_t opt, bool ex) {
  target = orDefault(target);
  source = orDefault(source);
  if (!stdOptions(opt) || !usable(source) || badArgs(target, size, out, len, in)) {
    setRc(target, VL_RC_BADARG);
    return -1;
  }
  bool charLen = (opt & VL_OPT_CHARLEN) != 0;
  auto *s = reinterpret_cast<const uint8_t *>(in);
  size_t bytes = len == 0 ? 0 : byteInput(source, ex, s, stateOf(ss), len, charLen);
  Shape sh{size, (opt & VL_OPT_NULLTERM) != 0, charLen, len < 0, len == 0, 5};
  const VLCodePage *tc = target->codePage;
  int32_t n = withUniReader(source, ex, s, bytes, stateOf(ss), [&](auto &r) {
    return drive(
        r,
        [&](size_t room, auto &&body) {
          return withByteWriter(tc, ex, reinterpret_cast<uint8_t *>(out), room, stateOf(ts), body);
        },
        sh, tc);
  });
  setRc(target, VL_RC_OK);
  return n;
}

inline int32_t stringToUnicode(VLUChar *out, int32_t count, VLLocale *l, const char *in, VLShiftState st,
                               int32_t len, uint32_t opt, bool ex) {
  l = orDefault(l);
  if (!stdOptions(opt) || badArgs(l, count, out, len, in)) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  auto *s = reinterpret_cast<const uint8_t *>(in);
  bool charLen = (opt & VL_OPT_CHARLEN) != 0;
  size_t bytes = len == 0 ? 0 : byteInput(l, ex, s, stateOf(st), len, charLen);
  // Characters in, units out: the output is never counted in characters.
  Shape sh{count, (opt & VL_OPT_NULLTERM) != 0, false, len < 0, len == 0, 1};
  int32_t n = withUniReader(l, ex, s, bytes, stateOf(st), [&](auto &r) {
    return drive(
        r,
        [&](size_t room, auto &&body) {
          U16Writer w(out, room);
          return body(w);
        },
        sh, l->codePage);
  });
  setRc(l, VL_RC_OK);
  return n;
}

inline int32_t unicodeToString(VLLocale *l, char *out, VLShiftState st, int32_t size, const VLUChar *in,
                               int32_t len, uint32_t opt, bool ex) {
  l = orDefault(l);
  if (!stdOptions(opt) || badArgs(l, size, out, len, in)) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  size_t units = len < 0 ? strLen(in) : static_cast<size_t>(len);
  Shape sh{size, (opt & VL_OPT_NULLTERM) != 0, (opt & VL_OPT_CHARLEN) != 0, len < 0, len == 0, 5};
  const VLCodePage *c = l->codePage;
  U16Reader r(in, units);
  int32_t n = drive(
      r,
      [&](size_t room, auto &&body) {
        return withByteWriter(c, ex, reinterpret_cast<uint8_t *>(out), room, stateOf(st), body);
      },
      sh, c);
  setRc(l, VL_RC_OK);
  return n;
}

// Only the exact word VL_OPT_CHARLEN has an effect; nothing is rejected.
inline int32_t mbToWide(VLLocale *l, VLWChar *out, int32_t count, const char *in, VLShiftState st, int32_t len,
                        uint32_t opt, bool ex) {
  l = orDefault(l);
  if (badArgs(l, count, out, len, in)) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  auto *s = reinterpret_cast<const uint8_t *>(in);
  // To the 0 means the 0 too: it becomes a W 0.
  size_t bytes = len < 0 ? strLen(s) + 1 : len == 0 ? 0 : byteInput(l, ex, s, stateOf(st), len, opt == VL_OPT_CHARLEN);
  Shape sh{count, false, false, false, bytes == 0, 1};
  int32_t n = withByteReader<RawW, RawW>(l, ex, s, bytes, stateOf(st), [&](auto &r) {
    return drive(
        r,
        [&](size_t room, auto &&body) {
          WWriter<SameW> w(l->codePage, out, room);
          return body(w);
        },
        sh, l->codePage);
  });
  setRc(l, VL_RC_OK);
  return n;
}

// 0 or exactly VL_OPT_CHARLEN; a run left open is not closed.
inline int32_t wideToMb(VLLocale *l, char *out, VLShiftState st, int32_t size, const VLWChar *in, int32_t count,
                        uint32_t opt, bool ex) {
  l = orDefault(l);
  if ((opt != 0 && opt != VL_OPT_CHARLEN) || badArgs(l, size, out, count, in)) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  size_t values = count < 0 ? strLen(in) + 1 : static_cast<size_t>(count);
  Shape sh{size, false, opt == VL_OPT_CHARLEN, false, values == 0, 5};
  const VLCodePage *c = l->codePage;
  auto *o = reinterpret_cast<uint8_t *>(out);
  WReader<WSame> r(c, in, values);
  int32_t n = drive(
      r,
      [&](size_t room, auto &&body) -> int32_t {
        if (ex && cp::isShift(c)) {
          ShiftWriter<RawEnc> w(c, o, room, stateOf(st));
          return body(w);
        }
        if (l->flags & VL_LF_SINGLEBYTE) {
          ByteWriter<RawSbEnc> w(c, o, room);
          return body(w);
        }
        ByteWriter<RawEnc> w(c, o, room);
        return body(w);
      },
      sh, c);
  setRc(l, VL_RC_OK);
  return n;
}

}  // namespace vl::cnv
