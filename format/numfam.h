// Numbers and money, each algorithm written once over the four text forms: Plain and Ex
// write code-page bytes (Shift-Out/Shift-In around double-byte characters in a
// shift-sensitive page; only Ex knows a caller's state to start from), W writes code-page
// characters as packed values, U writes UTF-16. Inside, every character is one 32-bit
// value: a packed code-page character (Plain, Ex, W) or a UTF-16 unit (U).
#pragma once
#include <cmath>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <type_traits>

#include "codepage/step.h"
#include "codepage/unimap.h"
#include "locale/info.h"

namespace vl::num {

using info::Form;
template <Form F>
using Unit = std::conditional_t<F == Form::W, VLWChar, std::conditional_t<F == Form::U, VLUChar, char>>;
template <Form F>
constexpr bool kBytes = F == Form::Plain || F == Form::Ex;

constexpr uint32_t kToStringOpts = VL_OPT_DEFAULTS | VL_OPT_NULLTERM | VL_NUM_UNSIGNED | VL_OPT_CHARLEN;
constexpr uint32_t kToLongOpts = VL_OPT_DEFAULTS | VL_NUM_DIGITS | VL_NUM_MONEY | VL_NUM_UNSIGNED | VL_OPT_CHARLEN;
constexpr uint32_t kDoubleOpts = VL_OPT_DEFAULTS | VL_OPT_NULLTERM | VL_OPT_CHARLEN;
constexpr uint32_t kToDoubleOpts = VL_OPT_DEFAULTS | VL_NUM_DIGITS | VL_NUM_MONEY | VL_OPT_CHARLEN;
constexpr uint32_t kCurrencyOpts = VL_OPT_DEFAULTS | VL_OPT_NULLTERM | VL_NUM_INTL | VL_OPT_CHARLEN;

// ---- Item texts -----------------------------------------------------------------------

constexpr uint32_t kTextMax = 32;  // characters of a symbol, sign or grouping text

struct Text {
  uint32_t c[kTextMax + 1] = {};
  uint32_t n = 0;
  uint32_t first() const { return n ? c[0] : 0; }
};

// A text item of the handle (or with `defaults` the territory's) as characters of the form.
template <Form F>
Text itemText(VLLocale *l, int32_t item, bool defaults) {
  Text t;
  uint32_t opts = defaults ? VL_OPT_DEFAULTS : 0;
  int32_t r;
  if constexpr (F == Form::U) {
    VLUChar b[kTextMax + 1];
    r = VLGetLocaleTextInfoU(l, item, b, kTextMax + 1, opts);
    for (int32_t i = 0; i + 1 < r; ++i) t.c[t.n++] = b[i];
  } else {
    VLWChar b[kTextMax + 1];
    r = VLGetLocaleTextInfoW(l, item, b, kTextMax + 1, opts);
    for (int32_t i = 0; i + 1 < r; ++i) t.c[t.n++] = b[i];
  }
  return t;
}
inline int32_t itemNum(VLLocale *l, int32_t item, bool defaults) {
  int32_t v = VLGetLocaleNumInfo(l, item, defaults ? 1 : 0);
  return v < 0 ? 0 : v;
}

// The fixed characters of a form: ASCII, or EBCDIC in a page that is not ASCII-based.
struct Glyphs {
  uint32_t zero, minus, plus, blank, open, close, semi;
  bool ascii;
};
template <Form F>
Glyphs glyphsOf(const VLLocale *l) {
  if (F == Form::U || cp::isAscii(l->codePage)) return {0x30, 0x2D, 0x2B, 0x20, 0x28, 0x29, 0x3B, true};
  return {0xF0, 0x60, 0x4E, 0x40, 0x4D, 0x5D, 0x5E, false};
}

// The digit table of a code page; IBM930 keeps its lower-case letters elsewhere.
inline const int32_t *digitTable(const VLCodePage *c) {
  if (cp::isAscii(c)) return VLAsciiToNum;
  return c->id == 930 || c->id == 5026 ? VLEbcdic930ToNum : VLEbcdicToNum;
}
inline const int32_t *digitTable(int32_t asciiBased) {
  return asciiBased == VL_DIGITS_ASCII ? VLAsciiToNum
         : asciiBased == VL_DIGITS_EBCDIC930 ? VLEbcdic930ToNum
                                               : VLEbcdicToNum;
}

// The value of a decimal digit of any script, or -1.
inline int32_t unicodeDigit(uint32_t u) {
  const VLUChar a = u <= 0xFFFF ? umap::asciiDigit(static_cast<VLUChar>(u)) : 0;
  return a ? static_cast<int32_t>(a - 0x30) : -1;
}

// ---- Grouping texts -------------------------------------------------------------------

// The next size of a grouping text in units of T; see VLStrGroupingSize.
template <class T>
int32_t groupingSize(bool ascii, const T *g, int32_t *remaining, T **next) {
  if (!remaining || !next) return -1;
  const uint32_t zero = ascii ? 0x30 : 0xF0, semi = ascii ? 0x3B : 0x5E;
  int32_t left = *remaining;
  if (!g || left == 0 || *g == 0) {
    *next = nullptr;
    *remaining = 0;
    return -1;
  }
  int32_t size = 0, i = 0, digits = 0;
  for (; (left < 0 || i < left) && g[i]; ++i) {
    const uint32_t c = static_cast<uint32_t>(g[i]);
    if (c == semi) break;
    if (c < zero || c > zero + 9) return -1;
    if (size < 10000) size = size * 10 + static_cast<int32_t>(c - zero);  // larger never groups anyway
    ++digits;
  }
  if (!digits) return -1;
  if ((left < 0 || i < left) && g[i]) ++i;  // the separator
  if (left >= 0) left -= i;
  if (left == 0 || !g[i]) {
    *next = nullptr;
    *remaining = 0;
  } else {
    *next = const_cast<T *>(g + i);
    *remaining = left;
  }
  return size;
}

// Group sizes from least significant on: a size of 0 repeats the one before, the end of
// the list (or a malformed text) ends grouping.
class Groups {
 public:
  Groups(const Text &g, bool ascii) : ascii_(ascii), rest_(static_cast<int32_t>(g.n)), next_(g.c) {
    size_ = read();
    if (size_ <= 0) size_ = kNever;
  }
  // Called after each digit; true when a separator belongs before the next one.
  bool step() {
    if (++count_ < size_) return false;
    count_ = 0;
    if (!repeat_) {
      int32_t s = read();
      if (s < 0) size_ = kNever;
      else if (s > 0) size_ = s;
      else repeat_ = true;  // 0: this size for the rest
    }
    return true;
  }

 private:
  static constexpr int32_t kNever = INT32_MAX;
  int32_t read() { return next_ ? groupingSize<const uint32_t>(ascii_, next_, &rest_, &next_) : -1; }
  bool ascii_;
  int32_t rest_;
  const uint32_t *next_;
  int32_t size_ = kNever, count_ = 0;
  bool repeat_ = false;
};

// ---- Building and writing text ----------------------------------------------------------

// A line of characters built before it is written. Big enough for the longest "%f" of a
// double grouped by ones, a decimal separator and the longest fraction.
constexpr uint32_t kMaxFraction = 255;
struct Chars {
  static constexpr uint32_t kCap = 1024;
  uint32_t c[kCap];
  uint32_t n = 0;
  void put(uint32_t v) {
    if (n < kCap) c[n++] = v;
  }
  void put(const Text &t) {
    for (uint32_t i = 0; i < t.n; ++i) put(t.c[i]);
  }
};

// Integer digits (ASCII, most significant first) as characters with group separators.
inline void putGrouped(Chars &out, const char *d, uint32_t n, uint32_t zero, uint32_t sep, const Text &grouping,
                       bool ascii) {
  uint32_t tmp[2 * 320];
  uint32_t k = 0;
  Groups g(grouping, ascii);
  const bool group = sep != 0 && grouping.n != 0;
  for (uint32_t i = n; i-- > 0 && k + 2 <= sizeof tmp / sizeof tmp[0];) {
    tmp[k++] = zero + static_cast<uint32_t>(d[i] - '0');
    if (group && g.step() && i > 0) tmp[k++] = sep;
  }
  while (k) out.put(tmp[--k]);
}

// Writes characters into the caller's buffer: whole characters only, a double-byte run
// of a shift-sensitive page opened and always closable, the size in units or (with
// `chars`) characters; one unit kept for the terminator when one is wanted.
template <Form F>
class Sink {
 public:
  using T = Unit<F>;
  Sink(const VLLocale *l, T *buf, int32_t size, bool chars, bool nul)
      : buf_(buf), size_(size - (nul ? 1 : 0)), chars_(chars), nul_(nul) {
    if constexpr (kBytes<F>) {
      shift_ = step::isShifted(l);
      so_ = cp::shiftOut(l->codePage);
      si_ = cp::shiftIn(l->codePage);
    }
  }
  // A caller in the double-byte state gets a shift-in first, with room for one more byte.
  bool openSingle() {
    if (size_ < 2) return false;
    buf_[used_++] = static_cast<T>(si_);
    return true;
  }
  bool put(uint32_t v) {
    if (full_) return false;
    if constexpr (!kBytes<F>) {
      if (used_ + 1 > size_) return full_ = true, false;
      buf_[used_++] = static_cast<T>(v);
    } else {
      uint8_t b[4];
      const int n = cp::wToMb(b, v);
      const bool w = shift_ && v > 0xFF;
      const int64_t change = shift_ && w != wide_ ? 1 : 0;
      if (chars_ ? count_ + 1 > size_ : used_ + change + n + (w ? 1 : 0) > size_) return full_ = true, false;
      if (change) {
        buf_[used_++] = static_cast<T>(w ? so_ : si_);
        wide_ = w;
      }
      for (int j = 0; j < n; ++j) buf_[used_++] = static_cast<T>(b[j]);
    }
    ++count_;
    return true;
  }
  void put(const Chars &cs) {
    for (uint32_t i = 0; i < cs.n && put(cs.c[i]); ++i) {
    }
  }
  bool full() const { return full_; }
  // Closes a double-byte run and terminates; the units (or characters) written.
  int32_t finish() {
    if (wide_) buf_[used_++] = static_cast<T>(si_);
    wide_ = false;
    if (nul_) {
      buf_[used_++] = 0;
      ++count_;
    }
    return static_cast<int32_t>(chars_ ? count_ : used_);
  }

 private:
  T *buf_;
  int64_t size_;
  bool chars_, nul_;
  bool shift_ = false, wide_ = false, full_ = false;
  uint8_t so_ = 0, si_ = 0;
  int64_t used_ = 0, count_ = 0;
};

// Writes a line into the caller's buffer with the common checks and codes of the writers.
template <Form F>
int32_t writeOut(VLLocale *l, const Chars &line, Unit<F> *buffer, VLShiftState state, int32_t size,
                 uint32_t options) {
  if (size <= 0 || !buffer) {
    setRc(l, VL_RC_BUFFER);
    return 0;
  }
  Sink<F> out(l, buffer, size, kBytes<F> && (options & VL_OPT_CHARLEN), (options & VL_OPT_NULLTERM) != 0);
  if constexpr (F == Form::Ex) {
    if (state && step::isShifted(l) && !out.openSingle()) {
      setRc(l, VL_RC_BUFFER);
      return 0;
    }
  }
  out.put(line);
  setRc(l, out.full() ? VL_RC_BUFFER : VL_RC_OK);
  return out.finish();
}

// The handle to work with, after the option check; null (code 2) when there is none or
// the options are refused.
inline VLLocale *begin(VLLocale *locale, uint32_t options, uint32_t allowed) {
  VLLocale *l = step::use(locale);
  if (!l) {
    setRc(orDefault(locale), VL_RC_BADARG);
    return nullptr;
  }
  if (options & ~allowed) {
    setRc(l, VL_RC_BADARG);
    return nullptr;
  }
  return l;
}

// The writers: the checks, then build(l, glyphs, line, defaults) composes the line.
template <Form F, class Build>
int32_t writeNumber(VLLocale *locale, Unit<F> *buffer, VLShiftState state, int32_t size, uint32_t options,
                    uint32_t allowed, Build build) {
  VLLocale *l = begin(locale, options, allowed);
  if (!l) return -1;
  Chars line;
  build(l, glyphsOf<F>(l), line, (options & VL_OPT_DEFAULTS) != 0);
  return writeOut<F>(l, line, buffer, state, size, options);
}

// ---- Fixed-point digits of a double -----------------------------------------------------

// "%f" of a value, split into integer and fraction digits; the fraction cut (not
// rounded) to `frac` digits, zeros added past the six "%f" gives. False when the value
// is not finite; `text` then holds what "%f" printed.
struct Fixed {
  char text[400];
  const char *intDigits;
  uint32_t intLen;
  const char *fracDigits;
  uint32_t fracLen;  // digits "%f" gave (6), of which frac are used
  bool finite;
};
inline void fixedOf(double v, Fixed *f) {
  std::snprintf(f->text, sizeof f->text, "%f", v);
  f->finite = std::isfinite(v);
  const char *p = f->text;
  if (*p == '-') ++p;
  f->intDigits = p;
  while (*p >= '0' && *p <= '9') ++p;
  f->intLen = static_cast<uint32_t>(p - f->intDigits);
  // Whatever the process's decimal point is, the fraction follows it.
  if (*p) ++p;
  f->fracDigits = p;
  f->fracLen = static_cast<uint32_t>(std::strlen(p));
}

// Integer digits grouped, the decimal separator (even with no fraction digits), then the
// fraction cut to `frac`.
inline void putFixed(Chars &out, const Fixed &f, uint32_t frac, uint32_t zero, uint32_t group,
                     const Text &grouping, uint32_t decimal, bool ascii) {
  putGrouped(out, f.intDigits, f.intLen, zero, group, grouping, ascii);
  if (decimal) out.put(decimal);
  if (frac > kMaxFraction) frac = kMaxFraction;
  for (uint32_t i = 0; i < frac; ++i)
    out.put(zero + (i < f.fracLen ? static_cast<uint32_t>(f.fracDigits[i] - '0') : 0));
}

// Letters of a non-finite value in the form's characters.
template <Form F>
void putWord(Chars &out, const VLLocale *l, const char *s) {
  for (; *s; ++s) {
    const VLUChar u = static_cast<unsigned char>(*s);
    out.put(F == Form::U ? u : cp::uniToW(l->codePage, u));
  }
}

// ---- Reading tokens ---------------------------------------------------------------------

// Where a reader stands: the unit and the shift state there.
struct Pos {
  uint32_t at = 0;
  uint32_t state = 0;
};

// Signs and separators a reader knows; empty texts match nothing.
struct Marks {
  Text plus, minus;
  uint32_t group = 0, decimal = 0;
};

// Reads characters and tokens of one form from s[0, n).
template <Form F>
class Reader {
 public:
  using T = Unit<F>;
  Reader(const VLLocale *l, const T *s, uint32_t n, const int32_t *table, bool anyScript)
      : c_(l->codePage), s_(s), n_(n), table_(table), any_(anyScript) {
    if constexpr (kBytes<F>) {
      shift_ = step::isShifted(l);
      so_ = cp::shiftOut(c_);
      si_ = cp::shiftIn(c_);
      dbl_ = cp::maxLen(c_) < 2 ? 2 : cp::maxLen(c_);
      single_ = (l->flags & VL_LF_SINGLEBYTE) != 0;
    }
  }

  // The character at p: its value, and p moved past it. False at the end.
  bool charAt(Pos &p, uint32_t *v, uint32_t *len = nullptr) const {
    if constexpr (!kBytes<F>) {
      if (p.at >= n_) return false;
      *v = static_cast<uint32_t>(s_[p.at++]);
      if (len) *len = 1;
      return true;
    } else {
      const auto *b = reinterpret_cast<const uint8_t *>(s_);
      if (shift_)
        while (p.at < n_ && (b[p.at] == so_ || b[p.at] == si_)) p.state = b[p.at++] == so_ ? 1 : 0;
      if (p.at >= n_) return false;
      uint32_t k = shift_ ? (p.state ? dbl_ : 1u) : single_ ? 1u : cp::lenOf(c_, b[p.at]);
      if (k == 0) k = 1;
      if (k > n_ - p.at) return false;
      *v = cp::readW(b + p.at, k);
      p.at += k;
      if (len) *len = k;
      return true;
    }
  }

  // Digit value of a character, or -1.
  int32_t digit(uint32_t v, uint32_t len) const {
    if constexpr (F == Form::U) {
      if (v < 0x80) return VLAsciiToNum[v];
      return any_ ? unicodeDigit(v) : -1;
    } else {
      if (len == 1 && v <= 0xFF) {
        int32_t d = table_[v];
        if (d >= 0 || !any_) return d;
      }
      return any_ ? unicodeDigit(cp::wToUni(c_, v)) : -1;
    }
  }
  bool blank(uint32_t v) const {
    uint32_t type = F == Form::U ? step::unicodeType(v)
                    : v < 0x100   ? cp::sbcsType(c_, static_cast<uint8_t>(v))
                                  : step::wType(c_, v);
    return (type & VL_C1_SPACE) != 0;
  }

  // Does t stand at p? p moves past it when it does.
  bool match(Pos &p, const Text &t) const {
    if (!t.n) return false;
    Pos q = p;
    for (uint32_t i = 0; i < t.n; ++i) {
      uint32_t v;
      if (!charAt(q, &v) || v != t.c[i]) return false;
    }
    p = q;
    return true;
  }

  // The token at p (see VLStrGetDigit); p moves past it unless it is -1.
  int32_t token(Pos &p, const Marks &m) const {
    if (match(p, m.plus)) return VL_TOK_PLUS;
    if (match(p, m.minus)) return VL_TOK_MINUS;
    Pos q = p;
    uint32_t v, len;
    if (!charAt(q, &v, &len)) return -1;
    if (m.group && v == m.group) return p = q, VL_TOK_GROUP;
    if (m.decimal && v == m.decimal) return p = q, VL_TOK_DECIMAL;
    int32_t d = digit(v, len);
    if (d >= 0) return p = q, d;
    if (!blank(v)) return -1;
    do {
      p = q;
    } while (charAt(q, &v) && v != m.group && v != m.decimal && blank(v));
    return VL_TOK_BLANK;
  }
  uint32_t size() const { return n_; }

 private:
  const VLCodePage *c_;
  const T *s_;
  uint32_t n_;
  const int32_t *table_;
  bool any_;
  bool shift_ = false, single_ = true;
  uint8_t so_ = 0, si_ = 0, dbl_ = 2;
};

// Units to read: a negative length runs to the terminator; with `chars` the length
// counts characters of the form.
template <Form F>
uint32_t inputUnits(const VLLocale *l, const Unit<F> *s, int32_t length, bool chars, uint32_t state) {
  if (!s) return 0;
  using U = std::conditional_t<kBytes<F>, unsigned char, Unit<F>>;
  const U *u = reinterpret_cast<const U *>(s);
  if (length < 0) return step::length(u);
  if (!chars || !kBytes<F>) return static_cast<uint32_t>(length);
  if constexpr (kBytes<F>) {
    if (step::isShifted(l)) return step::unitsOf(step::shiftedOf(l, state), u, static_cast<uint32_t>(length));
    return step::unitsOf(step::bytesOf(l), u, static_cast<uint32_t>(length));
  }
  return static_cast<uint32_t>(length);
}

// Signs and separators of a locale: money or numbers.
template <Form F>
Marks marksOf(VLLocale *l, const Glyphs &g, bool money, bool defaults, bool withDecimal) {
  Marks m;
  if (money) {
    m.plus = itemText<F>(l, 71, defaults);
    m.minus = itemText<F>(l, 72, defaults);
  } else {
    m.plus.c[m.plus.n++] = g.plus;
    m.minus.c[m.minus.n++] = g.minus;
  }
  m.group = itemText<F>(l, money ? 67 : 60, defaults).first();
  if (withDecimal) m.decimal = itemText<F>(l, money ? 66 : 59, defaults).first();
  return m;
}

// ---- Integers -----------------------------------------------------------------------------

template <Form F>
int32_t longToString(VLLocale *locale, int32_t value, Unit<F> *buffer, VLShiftState state, int32_t size,
                     uint32_t options) {
  auto build = [&](VLLocale *l, const Glyphs &g, Chars &line, bool defaults) {
    uint32_t mag = static_cast<uint32_t>(value);
    if (value < 0 && !(options & VL_NUM_UNSIGNED)) {
      line.put(g.minus);
      mag = 0u - mag;
    }
    char d[12];
    uint32_t n = 0;
    do {
      d[n++] = static_cast<char>('0' + mag % 10);
      mag /= 10;
    } while (mag);
    for (uint32_t i = 0; i < n / 2; ++i) std::swap(d[i], d[n - 1 - i]);
    putGrouped(line, d, n, g.zero, itemText<F>(l, 60, defaults).first(), itemText<F>(l, 62, defaults), g.ascii);
  };
  return writeNumber<F>(locale, buffer, state, size, options, kToStringOpts, build);
}

// The start state a reader takes from the caller: only Ex in a shift-sensitive page has one.
template <Form F>
uint32_t startState(const VLLocale *l, VLShiftState state) {
  return F == Form::Ex && step::isShifted(l) && state ? 1u : 0u;
}
template <Form F>
void setEnd(const Unit<F> *s, Pos p, Unit<F> **end, VLShiftState *endState) {
  if (end) *end = const_cast<Unit<F> *>(s) + p.at;
  if (endState) *endState = p.state;
}

// The readers' checks: the end outputs at the start, the handle, the radix (code 50),
// the options (code 2).
template <Form F>
VLLocale *beginRead(VLLocale *locale, const Unit<F> *s, VLShiftState state, Unit<F> **end, VLShiftState *endState,
                    uint32_t options, uint32_t allowed, int32_t radix = 10) {
  setEnd<F>(s, Pos{0, state}, end, endState);
  VLLocale *l = step::use(locale);
  if (l && radix != 0 && (radix < 2 || radix > 36)) {
    setRc(l, VL_RC_RADIX);
    return nullptr;
  }
  l = begin(locale, options, allowed);
  if (l) setRc(l, VL_RC_OK);
  return l;
}

template <Form F>
int32_t stringToLong(VLLocale *locale, const Unit<F> *s, VLShiftState state, int32_t length, Unit<F> **end,
                     VLShiftState *endState, int32_t radix, uint32_t options) {
  VLLocale *l = beginRead<F>(locale, s, state, end, endState, options, kToLongOpts, radix);
  if (!l) return 0;
  const bool uns = (options & VL_NUM_UNSIGNED) != 0;
  const Glyphs g = glyphsOf<F>(l);
  const Marks m = marksOf<F>(l, g, (options & VL_NUM_MONEY) != 0, (options & VL_OPT_DEFAULTS) != 0, false);
  const Pos start{0, startState<F>(l, state)};
  const uint32_t n = inputUnits<F>(l, s, length, (options & VL_OPT_CHARLEN) != 0, start.state);
  const Reader<F> rd(l, s, n, digitTable(l->codePage), !kBytes<F> || (options & VL_NUM_DIGITS));

  Pos p = start, q = p;  // p before the token in hand, q behind it
  int32_t t = rd.token(q, m);
  if (t == VL_TOK_BLANK) {
    p = q;
    t = rd.token(q, m);
  }
  bool neg = false;
  if (t == VL_TOK_PLUS || t == VL_TOK_MINUS) {
    if (t == VL_TOK_MINUS) {
      if (uns) return 0;
      neg = true;
    }
    p = q;
    t = rd.token(q, m);
  }
  if ((radix == 0 || radix == 16) && t == 0) {
    Pos r = q, r2;
    if (rd.token(r, m) == 33) {  // "x" or "X", when a hex digit follows
      r2 = r;
      const int32_t h = rd.token(r2, m);
      if (h >= 0 && h < 16) {
        radix = 16;
        p = r;
        q = r2;
        t = h;
      }
    }
    if (radix == 0) radix = 8;
  } else if (radix == 0) {
    radix = 10;
  }

  // Unsigned 32-bit arithmetic; reaching the limit marks, one more digit overflows.
  const uint32_t limit = 0xFFFFFFFFu / static_cast<uint32_t>(radix) + 1;
  uint32_t v = 0;
  bool any = false, mark = false, over = false;
  Pos stop = start;
  for (;;) {
    if (t >= 0 && t < radix) {
      if (mark) over = true;
      v = v * static_cast<uint32_t>(radix) + static_cast<uint32_t>(t);
      if (v >= limit) mark = true;
      if (!uns && v > 0x7FFFFFFFu) over = true;
      any = true;
      p = q;
      stop = p;
      t = rd.token(q, m);
      continue;
    }
    if (t == VL_TOK_GROUP && any) {  // only between digits
      Pos r = q;
      const int32_t d = rd.token(r, m);
      if (d >= 0 && d < radix) {
        p = q;
        q = r;
        t = d;
        continue;
      }
    }
    break;
  }
  if (!any) return 0;
  setEnd<F>(s, stop, end, endState);
  if (over) return uns ? -1 : neg ? INT32_MIN : INT32_MAX;
  return static_cast<int32_t>(neg ? 0u - v : v);
}

// A caller's 0-terminated sign or separator as characters of its form.
template <Form F>
Text textOf(const VLLocale *l, const Unit<F> *s) {
  Text t;
  if (!s) return t;
  using U = std::conditional_t<kBytes<F>, unsigned char, Unit<F>>;
  const Reader<F> rd(l, s, step::length(reinterpret_cast<const U *>(s)), VLAsciiToNum, false);
  Pos p;
  uint32_t v;
  while (t.n < kTextMax && rd.charAt(p, &v)) t.c[t.n++] = v;
  return t;
}

template <Form F>
int32_t getDigit(VLLocale *locale, Unit<F> **position, VLShiftState *state, int32_t length,
                 const Unit<F> *plus, const Unit<F> *minus, const Unit<F> *group, const Unit<F> *decimal,
                 int32_t asciiBased, uint32_t options) {
  VLLocale *l = step::use(locale);
  if (!l) {
    setRc(orDefault(locale), VL_RC_BADARG);
    return -1;
  }
  if (options & ~VL_NUM_DIGITS) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  setRc(l, VL_RC_OK);
  if (!position || !*position || length <= 0) return -1;
  Marks m;
  m.plus = textOf<F>(l, plus);
  m.minus = textOf<F>(l, minus);
  m.group = textOf<F>(l, group).first();
  m.decimal = textOf<F>(l, decimal).first();
  const Reader<F> rd(l, *position, static_cast<uint32_t>(length), digitTable(asciiBased),
                     !kBytes<F> || (options & VL_NUM_DIGITS));
  Pos p{0, state && F == Form::Ex ? (*state ? 1u : 0u) : 0u};
  const int32_t t = rd.token(p, m);
  *position += p.at;
  if (state) *state = p.state;
  return t;
}

// ---- Floating point -----------------------------------------------------------------------

template <Form F>
int32_t doubleToString(VLLocale *locale, double value, Unit<F> *buffer, VLShiftState state, int32_t size,
                       uint32_t options) {
  auto build = [&](VLLocale *l, const Glyphs &g, Chars &line, bool d) {
    Fixed f;
    fixedOf(value, &f);
    if (value < 0) line.put(g.minus);
    if (!f.finite)
      putWord<F>(line, l, f.text[0] == '-' ? f.text + 1 : f.text);
    else
      putFixed(line, f, static_cast<uint32_t>(itemNum(l, 63, d)), g.zero, itemText<F>(l, 60, d).first(),
               itemText<F>(l, 62, d), itemText<F>(l, 59, d).first(), g.ascii);
  };
  return writeNumber<F>(locale, buffer, state, size, options, kDoubleOpts, build);
}

template <Form F>
double stringToDouble(VLLocale *locale, const Unit<F> *s, VLShiftState state, int32_t length, Unit<F> **end,
                      VLShiftState *endState, uint32_t options) {
  VLLocale *l = beginRead<F>(locale, s, state, end, endState, options, kToDoubleOpts);
  if (!l) return 0;
  const Glyphs g = glyphsOf<F>(l);
  const Marks m = marksOf<F>(l, g, (options & VL_NUM_MONEY) != 0, (options & VL_OPT_DEFAULTS) != 0, true);
  Marks exp = m;  // an exponent takes the plain signs, also in money
  exp.plus = Text{{g.plus}, 1};
  exp.minus = Text{{g.minus}, 1};
  const Pos start{0, startState<F>(l, state)};
  const uint32_t n = inputUnits<F>(l, s, length, (options & VL_OPT_CHARLEN) != 0, start.state);
  const Reader<F> rd(l, s, n, digitTable(l->codePage), !kBytes<F> || (options & VL_NUM_DIGITS));

  int32_t st = 0, sign = 1, fracExp = 0, expSign = 1, expo = 0;
  double v = 0;
  Pos p = start;
  for (;;) {
    Pos q = p;
    const int32_t t = rd.token(q, st >= 6 ? exp : m);
    if (t < 0) break;
    const int32_t next = VLStrDoubleNextState(st, t, &v, &sign, &fracExp, &expSign, &expo);
    if (next < 0) break;
    st = next;
    p = q;
  }
  setEnd<F>(s, p, end, endState);
  return sign * v * std::pow(10.0, expSign * expo);
}

// ---- Money -----------------------------------------------------------------------------------

template <Form F>
int32_t currencyToString(VLLocale *locale, Unit<F> *buffer, VLShiftState state, int32_t size, uint32_t options,
                         double amount) {
  auto build = [&](VLLocale *l, const Glyphs &g, Chars &line, bool d) {
    const bool intl = (options & VL_NUM_INTL) != 0, neg = amount < 0.0;
    const Text sign = itemText<F>(l, neg ? 72 : 71, d), symbol = itemText<F>(l, intl ? 65 : 64, d);
    const bool precedes = itemNum(l, neg ? 75 : 73, d) != 0, blank = itemNum(l, neg ? 76 : 74, d) != 0;
    const Text open{{g.open}, 1}, close{{g.close}, 1}, space{{g.blank}, 1};

    // The prefix in text order; the suffix in the order its pieces are taken, which is
    // the reverse of the text's: the first piece ends the text.
    const Text *pre[4], *suf[4];
    int np = 0, ns = 0;
    auto sym = [&] {
      if (precedes) pre[np++] = &symbol;
      else suf[ns++] = &symbol;
  };
  switch (itemNum(l, neg ? 78 : 77, d)) {
    case 0:
      pre[np++] = &open;
      suf[ns++] = &close;
      sym();
      break;
    case 2:
      suf[ns++] = &sign;
      sym();
      break;
    case 3:  // the sign just before the symbol
      if (precedes) pre[np++] = &sign, pre[np++] = &symbol;
      else suf[ns++] = &symbol, suf[ns++] = &sign;
      break;
    case 4:  // the sign just after the symbol
      if (precedes) pre[np++] = &symbol, pre[np++] = &sign;
      else suf[ns++] = &sign, suf[ns++] = &symbol;
      break;
    default:  // 1, and positions no territory defines
      pre[np++] = &sign;
      sym();
      break;
  }
  if (blank) {
    if (precedes) pre[np++] = &space;
    else suf[ns++] = &space;
  }

  for (int i = 0; i < np; ++i) line.put(*pre[i]);
  Fixed f;
  fixedOf(amount, &f);
  if (!f.finite)
    putWord<F>(line, l, f.text[0] == '-' ? f.text + 1 : f.text);
  else
    putFixed(line, f, static_cast<uint32_t>(itemNum(l, intl ? 70 : 69, d)), g.zero, itemText<F>(l, 67, d).first(),
             itemText<F>(l, 68, d), itemText<F>(l, 66, d).first(), g.ascii);
  for (int i = ns; i-- > 0;) line.put(*suf[i]);
  };
  return writeNumber<F>(locale, buffer, state, size, options, kCurrencyOpts, build);
}

}  // namespace vl::num
