// Times to text and back, each walk written once over the forms of codepage/step.h:
// Bytes (plain pages), Shifted (Shift-Out/Shift-In pages), W values and UTF-16 units.
// Names and nested patterns are the locale's text items, fetched in the walk's form.
#pragma once
#include <cstdint>
#include <cstring>
#include <ctime>

#include "codepage/step.h"
#include "locale/info.h"

namespace vl::tf {

using namespace vl::step;

// Directive codes: the tables hold VL_TM_BASE + code.
enum Code : int {
  kPercent = 0,
  kModifier = 1,
  kAbDay = 10,
  kDayName = 40,
  kAbMon = 11,
  kMonName = 41,
  kDateTime = 12,
  kMday = 13,
  kHour = 47,
  kHour12 = 48,
  kYday = 18,
  kMonth = 22,
  kMinute = 52,
  kAmPm = 25,
  kSecond = 58,
  kWeekSun = 60,
  kWday = 32,
  kWeekMon = 62,
  kDate = 33,
  kTime = 63,
  kYear2 = 34,
  kYear4 = 64,
  kZone = 35,
  kZoneName = 65,
};

// Items the directives read.
constexpr int kItemDay = 16, kItemAbDay = 23, kItemMon = 30, kItemAbMon = 43, kItemAm = 56;
constexpr int kItemTime = 79, kItemShortDate = 80, kItemLongDate = 81;

// Units kept for one name or nested pattern (the longest generated names are about 60
// bytes in UTF-8).
constexpr int32_t kItemMax = 128;
// Nested patterns may name further patterns; a locale whose patterns refer to each other
// in a loop is stopped here.
constexpr int kMaxDepth = 4;

constexpr uint32_t kFormatOptions = VL_OPT_DEFAULTS | VL_OPT_NULLTERM | VL_OPT_CHARLEN;
constexpr uint32_t kParseOptions = VL_OPT_DEFAULTS | VL_OPT_CHARLEN;

// What a walk needs of its locale: the directive table, the digits and blank of the form,
// and where names come from.
template <class F>
struct Ctx {
  VLLocale *l;
  F f;  // the form, state 0
  const int32_t *table;
  U<F> zero, blank;
  uint32_t itemOpts;

  int code(U<F> u) const {
    if (static_cast<uint32_t>(u) > 255) return -1;
    int32_t e = table[static_cast<uint32_t>(u)];
    return e < VL_TM_BASE ? -1 : e - VL_TM_BASE;
  }
};

inline const int32_t *tableOf(const VLCodePage *c) {
  if (cp::isAscii(c)) return VLAsciiTMChar;
  return c->id == 930 ? VLEbcdic930TMChar : VLEbcdicTMChar;
}

template <class F>
Ctx<F> ctxOf(VLLocale *l, F f, bool defaults, bool ascii) {
  f.state = 0;
  Ctx<F> c{l, f, VLAsciiTMChar, 0x30, 0x20, defaults ? VL_OPT_DEFAULTS : 0u};
  if constexpr (!std::is_same_v<F, UForm>) {
    c.table = tableOf(l->codePage);
    if (!ascii) c.zero = 0xF0, c.blank = 0x40;
  }
  return c;
}
template <class F>
Ctx<F> ctxOf(VLLocale *l, F f, bool defaults) {
  return ctxOf(l, f, defaults, cp::isAscii(l->codePage));
}

// An item in the form's units, starting in the single-byte state: its length without the
// terminator, or -1 with the getter's code in the handle.
inline int32_t fetch(const Ctx<Bytes> &c, int item, unsigned char *b) {
  return info::getText<info::Form::Plain>(c.l, item, cb(b), 0, kItemMax, c.itemOpts) - 1;
}
inline int32_t fetch(const Ctx<Shifted> &c, int item, unsigned char *b) {
  return info::getText<info::Form::Ex>(c.l, item, cb(b), 0, kItemMax, c.itemOpts) - 1;
}
inline int32_t fetch(const Ctx<WForm> &c, int item, VLWChar *b) {
  return info::getText<info::Form::W>(c.l, item, b, 0, kItemMax, c.itemOpts) - 1;
}
inline int32_t fetch(const Ctx<UForm> &c, int item, VLUChar *b) {
  return info::getText<info::Form::U>(c.l, item, b, 0, kItemMax, c.itemOpts) - 1;
}
inline uint32_t lastRc(const VLLocale *l) {
  return l->lastError > 0 ? static_cast<uint32_t>(l->lastError) : VL_RC_BADARG;
}

// Length of the character at p in state st; a lead byte the page does not know stands
// for itself.
template <class F>
uint32_t charLen(const F &f, const U<F> *p) {
  uint32_t n = f.len(p);
  return n ? n : 1u;
}

// ---- Output ---------------------------------------------------------------------------

// Where text goes. Shift bytes are written only when a character needs the other state,
// and a double-byte character always leaves room for the shift-in that closes it. With
// `chars` the room is counted in characters.
template <class F>
struct Sink {
  F f;  // f.state: the state the output is in
  U<F> *buf;
  uint32_t pos, size;
  bool chars = false;
  uint32_t count = 0, limit = 0;

  bool put(const U<F> *c, uint32_t len, uint32_t wide) {
    uint32_t need = len;
    if constexpr (F::kShift) need += (wide != f.state ? 1u : 0u) + wide;
    if (chars ? count >= limit : pos > size || need > size - pos) return false;
    if constexpr (F::kShift) {
      if (wide != f.state) {
        buf[pos++] = wide ? f.so : f.si;
        f.state = wide;
      }
    }
    for (uint32_t k = 0; k < len; ++k) buf[pos++] = c[k];
    ++count;
    return true;
  }
  // Returns the output to the single-byte state (room for this was kept).
  bool close() {
    if constexpr (F::kShift) {
      if (f.state) {
        if (!chars && pos >= size) return false;
        buf[pos++] = f.si;
        f.state = 0;
      }
    }
    return true;
  }
};

// The low `width` digits of v, most significant first; with `mod` no leading zeros.
template <class F>
uint32_t writeNumber(Sink<F> &out, U<F> zero, int64_t v, int width, bool mod) {
  if (v < 0) v = -v;
  uint8_t d[10];
  for (int k = width - 1; k >= 0; --k, v /= 10) d[k] = static_cast<uint8_t>(v % 10);
  int k = 0;
  if (mod)
    while (k < width - 1 && d[k] == 0) ++k;
  for (; k < width; ++k) {
    U<F> u = static_cast<U<F>>(zero + d[k]);
    if (!out.put(&u, 1, 0)) return VL_RC_BUFFER;
  }
  return VL_RC_OK;
}

// Walks a text of the form (starting single-byte) and hands each character to fn(p, len,
// wide); stops when fn says false.
template <class F, class Fn>
bool eachChar(F f, const U<F> *s, uint32_t n, Fn fn) {
  f.state = 0;
  Walk<F> w{f, s, n};
  uint32_t at, len;
  while (w.next(at, len))
    if (!fn(s + at, len, F::kShift ? w.f.state : 0u)) return false;
  return true;
}

template <class F>
uint32_t writeWord(const Ctx<F> &c, Sink<F> &out, int item) {
  U<F> b[kItemMax];
  int32_t n = fetch(c, item, b);
  if (n < 0) return lastRc(c.l);
  bool ok = eachChar(c.f, b, static_cast<uint32_t>(n),
                     [&](const U<F> *p, uint32_t len, uint32_t wide) { return out.put(p, len, wide); });
  return ok ? VL_RC_OK : VL_RC_BUFFER;
}

// The code of the directive whose percent sign is at p[*at] (with `mod` set after a "#");
// *at moves past it. kMalformed when the pattern ends first.
constexpr int kMalformed = -2;
template <class F>
int directiveAt(const Ctx<F> &c, const U<F> *p, uint32_t n, uint32_t *at, bool *mod) {
  uint32_t i = *at + 1;
  if (i >= n) return kMalformed;
  int code = c.code(p[i]);
  if (code == kModifier) {
    *mod = true;
    if (++i >= n) return kMalformed;
    code = c.code(p[i]);
  }
  *at = i + 1;
  return code;
}

// Walks a pattern: its shift bytes only change its own state; a percent sign in the
// single-byte state goes to directive(at) (which moves *at), every other character to
// literal(p, len, wide). Either answers 0 or a code that stops the walk.
template <class F, class D, class L>
uint32_t walkPattern(const Ctx<F> &c, const U<F> *p, uint32_t n, uint32_t state, uint32_t *endState, D directive,
                     L literal) {
  F pf = c.f;
  pf.state = state;
  uint32_t i = 0, rc = VL_RC_OK;
  while (i < n && rc == VL_RC_OK) {
    if constexpr (F::kShift) {
      if (pf.isShift(p[i])) {
        pf.shift(p[i++]);
        continue;
      }
    }
    const uint32_t len = charLen(pf, p + i);
    if (len > n - i) {
      rc = VL_RC_BADPATTERN;  // ends inside a character
      break;
    }
    const uint32_t wide = F::kShift ? pf.state : 0u;
    if (len == 1 && !wide && c.code(p[i]) == kPercent) {
      rc = directive(&i);
    } else {
      rc = literal(p + i, len, wide);
      i += len;
    }
  }
  *endState = pf.state;
  return rc;
}

// Runs fn(text, units) over a nested pattern item; patterns naming patterns stop at
// kMaxDepth.
template <class F, class Fn>
uint32_t withPattern(const Ctx<F> &c, int item, int depth, Fn fn) {
  if (depth >= kMaxDepth) return VL_RC_BADPATTERN;
  U<F> b[kItemMax];
  int32_t n = fetch(c, item, b);
  if (n < 0) return lastRc(c.l);
  return fn(static_cast<const U<F> *>(b), static_cast<uint32_t>(n));
}

// ---- Formatting -----------------------------------------------------------------------

template <class F>
struct Fmt {
  Ctx<F> c;
  const std::tm *t;
  Sink<F> out;
};

template <class F>
uint32_t formatWalk(Fmt<F> &x, const U<F> *p, uint32_t n, uint32_t state, int depth, uint32_t *endState);

template <class F>
uint32_t nested(Fmt<F> &x, int item, int depth) {
  return withPattern(x.c, item, depth, [&](const U<F> *b, uint32_t n) {
    uint32_t end;
    return formatWalk(x, b, n, 0, depth + 1, &end);
  });
}

inline bool inRange(int v, int lo, int hi) { return v >= lo && v <= hi; }

// Week of the year: full weeks before the day, plus one when the day lies on or after the
// first day of its week (first: the weekday index of the week's first day).
inline int weekOf(const std::tm &t, int first) {
  int d = (t.tm_wday - first + 7) % 7;
  return t.tm_yday / 7 + (t.tm_yday % 7 >= d ? 1 : 0);
}

// Expands the directive whose percent sign is at p[*at]; *at moves past it.
template <class F>
uint32_t expand(Fmt<F> &x, const U<F> *p, uint32_t n, uint32_t *at, int depth) {
  const uint32_t start = *at;
  bool mod = false;
  const int code = directiveAt(x.c, p, n, at, &mod);
  if (code == kMalformed) return VL_RC_BADPATTERN;
  const std::tm &t = *x.t;
  Sink<F> &out = x.out;
  auto num = [&](bool ok, int64_t v, int width) {
    return ok ? writeNumber(out, x.c.zero, v, width, mod) : VL_RC_NOTFOUND;
  };
  auto word = [&](bool ok, int item) { return ok ? writeWord(x.c, out, item) : VL_RC_NOTFOUND; };
  const bool wday = inRange(t.tm_wday, 0, 6), mon = inRange(t.tm_mon, 0, 11), hour = inRange(t.tm_hour, 0, 23);
  const int64_t year = int64_t{t.tm_year} + 1900;
  switch (code) {
    case kPercent:
      return out.put(p + start, 1, 0) ? VL_RC_OK : VL_RC_BUFFER;
    case kAbDay:
      return word(wday, kItemAbDay + t.tm_wday);
    case kDayName:
      return word(wday, kItemDay + t.tm_wday);
    case kAbMon:
      return word(mon, kItemAbMon + t.tm_mon);
    case kMonName:
      return word(mon, kItemMon + t.tm_mon);
    case kAmPm:
      return word(hour, kItemAm + (t.tm_hour >= 12 ? 1 : 0));
    case kMday:
      return num(inRange(t.tm_mday, 0, 31), t.tm_mday, 2);
    case kHour:
      return num(hour, t.tm_hour, 2);
    case kHour12:
      return num(hour, t.tm_hour % 12 ? t.tm_hour % 12 : 12, 2);
    case kYday:
      return num(inRange(t.tm_yday, 0, 365), t.tm_yday, 3);
    case kMonth:
      return num(mon, t.tm_mon + 1, 2);
    case kMinute:
      return num(inRange(t.tm_min, 0, 59), t.tm_min, 2);
    case kSecond:
      return num(inRange(t.tm_sec, 0, 59), t.tm_sec, 2);
    case kWday:
      return num(wday, t.tm_wday, 1);
    case kWeekSun:
    case kWeekMon: {
      const bool ok = wday && inRange(t.tm_yday, 0, 365);
      return num(ok, ok ? weekOf(t, code == kWeekSun ? 0 : 1) : 0, 2);
    }
    case kYear2:
      return num(true, year, 2);
    case kYear4:
      return num(true, year, 4);
    case kDate:
      return nested(x, mod ? kItemLongDate : kItemShortDate, depth);
    case kTime:
      return nested(x, kItemTime, depth);
    case kDateTime: {
      uint32_t rc = nested(x, mod ? kItemLongDate : kItemShortDate, depth);
      if (rc == VL_RC_OK) rc = out.put(&x.c.blank, 1, 0) ? VL_RC_OK : VL_RC_BUFFER;
      return rc == VL_RC_OK ? nested(x, kItemTime, depth) : rc;
    }
    default:
      return VL_RC_NOTFOUND;  // %z, %Z and letters that are no directive
  }
}

// Copies the pattern's text and expands its directives; the output gets shift bytes of
// its own where its characters need them.
template <class F>
uint32_t formatWalk(Fmt<F> &x, const U<F> *p, uint32_t n, uint32_t state, int depth, uint32_t *endState) {
  return walkPattern(
      x.c, p, n, state, endState, [&](uint32_t *at) { return expand(x, p, n, at, depth); },
      [&](const U<F> *ch, uint32_t len, uint32_t wide) { return x.out.put(ch, len, wide) ? VL_RC_OK : VL_RC_BUFFER; });
}

// Units of a length given in characters (byte forms).
template <class F>
uint32_t unitsFor(F f, const U<F> *s, int32_t len, bool chars) {
  if (len < 0) return length(s);
  return chars ? unitsOf(f, s, static_cast<uint32_t>(len)) : static_cast<uint32_t>(len);
}

// The driver of the VLTimeToString family; f carries the pattern's state, outState the
// buffer's.
template <class F>
int32_t format(VLLocale *l, F f, const std::tm *t, U<F> *buf, uint32_t outState, int32_t size, const U<F> *pat,
               int32_t patLen, uint32_t options) {
  if (options & ~kFormatOptions) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  const bool chars = !F::kUnits && (options & VL_OPT_CHARLEN);
  const bool term = (options & VL_OPT_NULLTERM) != 0;
  if (chars && size == 0) {
    setRc(l, VL_RC_BUFFER);
    return 0;
  }
  if (patLen == 0) {
    setRc(l, VL_RC_OK);
    return 0;
  }
  if (!t || !pat || !buf || size < 0) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  const uint32_t n = unitsFor(f, pat, patLen, chars);
  const uint32_t room = static_cast<uint32_t>(size);
  if (term && room == 0) {
    setRc(l, VL_RC_BUFFER);
    return -1;
  }
  Fmt<F> x{ctxOf(l, f, (options & VL_OPT_DEFAULTS) != 0), t, Sink<F>{f, buf, 0, room - (term ? 1 : 0)}};
  x.out.f.state = F::kShift ? outState : 0u;
  if (chars) {
    x.out.chars = true;
    x.out.limit = x.out.size;
  }
  uint32_t end = 0;
  uint32_t rc = formatWalk(x, pat, n, f.state, 0, &end);
  // A pattern that is back in the single-byte state leaves the output there too.
  if (rc == VL_RC_OK && end == 0 && !x.out.close()) rc = VL_RC_BUFFER;
  if (term) {
    x.out.close();  // fails only where the caller's buffer began double-byte and is full
    x.out.buf[x.out.pos++] = 0;
    ++x.out.count;
  }
  setRc(l, rc);
  if (rc != VL_RC_OK) return -1;
  return static_cast<int32_t>(chars ? x.out.count : x.out.pos);
}

// The handle to work on; null (after noting 2 where there is a handle) when it has no
// usable code page.
inline VLLocale *usable(VLLocale *locale) {
  VLLocale *l = use(locale);
  if (!l) setRc(orDefault(locale), VL_RC_BADARG);
  return l;
}

// The VLStrExpandTime family: one directive at *patPos, output at *pos.
template <class F>
uint32_t expandAt(VLLocale *l, F f, const std::tm *t, U<F> *buf, int32_t *pos, VLShiftState *state, int32_t size,
                  const U<F> *pat, int32_t *patPos, int32_t patLen, uint32_t options) {
  if ((options & ~VL_OPT_DEFAULTS) || !t || !buf || !pos || !pat || !patPos || size < 0 || *pos < 0 || *pos > size ||
      *patPos < 0)
    return setRc(l, VL_RC_BADARG);
  const uint32_t n = resolveLen(pat, patLen);
  uint32_t at = static_cast<uint32_t>(*patPos);
  if (at >= n) return setRc(l, VL_RC_BADARG);
  Fmt<F> x{ctxOf(l, f, options != 0), t, Sink<F>{f, buf, static_cast<uint32_t>(*pos), static_cast<uint32_t>(size)}};
  x.out.f.state = F::kShift && state ? *state : 0u;
  if (x.c.code(pat[at]) != kPercent) return setRc(l, VL_RC_BADPATTERN);
  uint32_t rc = expand(x, pat, n, &at, 0);
  *pos = static_cast<int32_t>(x.out.pos);
  if (state) *state = x.out.f.state;
  if (rc == VL_RC_OK) *patPos = static_cast<int32_t>(at);
  return setRc(l, rc);
}

// The writers: a sink over the caller's buffer from *pos.
template <class F, class Fn>
uint32_t writeAt(VLLocale *l, F f, U<F> *buf, int32_t *pos, VLShiftState *state, int32_t size, Fn fn) {
  if (!buf || !pos || size < 0 || *pos < 0 || *pos > size) return setRc(l, VL_RC_BADARG);
  Sink<F> out{f, buf, static_cast<uint32_t>(*pos), static_cast<uint32_t>(size)};
  out.f.state = F::kShift && state ? *state : 0u;
  uint32_t rc = fn(out);
  *pos = static_cast<int32_t>(out.pos);
  if (state) *state = out.f.state;
  return setRc(l, rc);
}

template <class F>
uint32_t writeWordAt(VLLocale *l, F f, U<F> *buf, int32_t *pos, VLShiftState *state, int32_t size, int32_t item,
                     int32_t source) {
  if (source != 0 && source != 1) return setRc(l, VL_RC_BADARG);
  const Ctx<F> c = ctxOf(l, f, source == 1);
  return writeAt(l, f, buf, pos, state, size, [&](Sink<F> &out) { return writeWord(c, out, item); });
}

// A number that leaves the buffer full answers 40 as well: a caller appending more
// learns there is no room before trying.
template <class F>
uint32_t writeNumberAt(VLLocale *l, F f, U<F> *buf, int32_t *pos, VLShiftState *state, int32_t size, int32_t value,
                       int32_t width, bool ascii, bool mod) {
  if (width < 1 || width > 10) return setRc(l, VL_RC_BADARG);
  const Ctx<F> c = ctxOf(l, f, false, ascii);
  return writeAt(l, f, buf, pos, state, size, [&](Sink<F> &out) {
    uint32_t rc = writeNumber(out, c.zero, value, width, mod);
    return rc == VL_RC_OK && out.pos >= out.size ? VL_RC_BUFFER : rc;
  });
}

// Picks the byte form of a locale: Shifted for a shift-sensitive page (state st), else Bytes.
template <class Fn>
auto byteForm(VLLocale *l, VLShiftState st, Fn fn) {
  return isShifted(l) ? fn(shiftedOf(l, st)) : fn(bytesOf(l));
}

}  // namespace vl::tf
