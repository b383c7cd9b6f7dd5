// Reading times: the inverse walk of timefam.h over the same forms. Literal characters are
// compared character by character, each side following its own shift bytes, so text a
// formatter wrote with its shift bytes placed differently from the pattern's still reads.
#pragma once
#include <algorithm>

#include "format/timefam.h"

namespace vl::tf {

// The input: s[0, n), the position and (Shifted) the state there.
template <class F>
struct In {
  F f;
  const U<F> *s;
  uint32_t pos, n;

  void skipShifts() {
    if constexpr (F::kShift)
      while (pos < n && f.isShift(s[pos])) f.shift(s[pos++]);
  }
  // Takes the character c (len units, in the double-byte state when wide) when it is next.
  bool take(const U<F> *c, uint32_t len, uint32_t wide) {
    In probe = *this;
    probe.skipShifts();
    if (probe.pos >= n || (F::kShift && probe.f.state != wide)) return false;
    if (charLen(probe.f, s + probe.pos) != len || len > n - probe.pos) return false;
    for (uint32_t k = 0; k < len; ++k)
      if (s[probe.pos + k] != c[k]) return false;
    probe.pos += len;
    *this = probe;
    return true;
  }
};

// 1 to width digits at the position, at most max; 37 leaves the position as it was.
template <class F>
uint32_t readNumber(In<F> &in, U<F> zero, uint32_t width, int32_t max, int32_t *out) {
  In<F> probe = in;
  probe.skipShifts();
  if (F::kShift && probe.f.state) return VL_RC_NOTFOUND;
  int64_t v = 0;
  uint32_t k = 0;
  for (; k < width && probe.pos < probe.n; ++k, ++probe.pos) {
    const uint32_t u = probe.s[probe.pos];
    if (u < zero || u > zero + 9u) break;
    v = std::min<int64_t>(v * 10 + (u - zero), INT64_C(1) << 40);  // a caller's width may be huge
  }
  if (k == 0 || v > max) return VL_RC_NOTFOUND;
  in = probe;
  *out = static_cast<int32_t>(v);
  return VL_RC_OK;
}

// The longest of items first .. first + count - 1 next in the input (the first among
// equals); the position moves past it.
template <class F>
uint32_t readWord(const Ctx<F> &c, In<F> &in, int first, int count, int32_t *index) {
  int32_t best = -1;
  In<F> bestEnd = in;
  for (int k = 0; k < count; ++k) {
    U<F> b[kItemMax];
    int32_t n = fetch(c, first + k, b);
    if (n < 0) return lastRc(c.l);
    In<F> probe = in;
    bool ok = eachChar(c.f, b, static_cast<uint32_t>(n),
                       [&](const U<F> *p, uint32_t len, uint32_t wide) { return probe.take(p, len, wide); });
    if (ok && (best < 0 || probe.pos > bestEnd.pos)) {
      best = k;
      bestEnd = probe;
    }
  }
  if (best < 0) return VL_RC_NOTFOUND;
  in = bestEnd;
  *index = best;
  return VL_RC_OK;
}

template <class F>
struct Scan {
  Ctx<F> c;
  std::tm *t;
  In<F> in;
  int afternoon = -1;  // -1 no "%p" read yet
};

template <class F>
uint32_t scanWalk(Scan<F> &x, const U<F> *p, uint32_t n, uint32_t state, int depth, uint32_t *endState);

template <class F>
uint32_t scanNested(Scan<F> &x, int item, int depth) {
  return withPattern(x.c, item, depth, [&](const U<F> *b, uint32_t n) {
    uint32_t end;
    return scanWalk(x, b, n, 0, depth + 1, &end);
  });
}

// Reads the directive whose percent sign is at p[*at]; *at moves past it.
template <class F>
uint32_t extract(Scan<F> &x, const U<F> *p, uint32_t n, uint32_t *at, int depth) {
  const uint32_t start = *at;
  bool mod = false;
  const int code = directiveAt(x.c, p, n, at, &mod);
  if (code == kMalformed) return VL_RC_BADPATTERN;
  std::tm &t = *x.t;
  int32_t v = 0;
  // A number into a field: the field takes value + delta.
  auto num = [&](uint32_t width, int32_t max, int &field, int delta) {
    uint32_t rc = readNumber(x.in, x.c.zero, width, max, &v);
    if (rc == VL_RC_OK) field = v + delta;
    return rc;
  };
  auto word = [&](int first, int count, int &field) {
    uint32_t rc = readWord(x.c, x.in, first, count, &v);
    if (rc == VL_RC_OK) field = v;
    return rc;
  };
  switch (code) {
    case kPercent:
      return x.in.take(p + start, 1, 0) ? VL_RC_OK : VL_RC_NOTFOUND;
    case kAbDay:
      return word(kItemAbDay, 7, t.tm_wday);
    case kDayName:
      return word(kItemDay, 7, t.tm_wday);
    case kAbMon:
      return word(kItemAbMon, 12, t.tm_mon);
    case kMonName:
      return word(kItemMon, 12, t.tm_mon);
    case kAmPm:
      return word(kItemAm, 2, x.afternoon);
    case kMday:
      return num(2, 31, t.tm_mday, 0);
    case kHour:
      return num(2, 23, t.tm_hour, 0);
    case kHour12: {
      uint32_t rc = num(2, 12, t.tm_hour, 0);
      if (rc == VL_RC_OK && t.tm_hour == 12) t.tm_hour = 0;
      return rc;
    }
    case kYday:
      return num(3, 366, t.tm_yday, 0);
    case kMonth:
      return num(2, 12, t.tm_mon, -1);
    case kMinute:
      return num(2, 59, t.tm_min, 0);
    case kSecond:
      return num(2, 59, t.tm_sec, 0);
    case kWday:
      return num(1, 6, t.tm_wday, 0);
    case kYear2:
      return num(2, 99, t.tm_year, 0);  // no century window: 07 is 1907
    case kYear4:
      return num(4, 9999, t.tm_year, -1900);
    case kDate:
      return scanNested(x, mod ? kItemLongDate : kItemShortDate, depth);
    case kTime:
      return scanNested(x, kItemTime, depth);
    case kDateTime: {
      uint32_t rc = scanNested(x, mod ? kItemLongDate : kItemShortDate, depth);
      if (rc == VL_RC_OK) rc = x.in.take(&x.c.blank, 1, 0) ? VL_RC_OK : VL_RC_NOTFOUND;
      return rc == VL_RC_OK ? scanNested(x, kItemTime, depth) : rc;
    }
    default:
      return VL_RC_BADPATTERN;  // weeks, zones and letters without a reader
  }
}

// A literal character of the pattern must be the next character of the input.
template <class F>
uint32_t scanWalk(Scan<F> &x, const U<F> *p, uint32_t n, uint32_t state, int depth, uint32_t *endState) {
  return walkPattern(
      x.c, p, n, state, endState, [&](uint32_t *at) { return extract(x, p, n, at, depth); },
      [&](const U<F> *ch, uint32_t len, uint32_t wide) { return x.in.take(ch, len, wide) ? VL_RC_OK : VL_RC_NOTFOUND; });
}

// The driver of the VLStringToTime family; f carries the pattern's state, inState the
// input's.
template <class F>
int32_t parse(VLLocale *l, F f, std::tm *t, const U<F> *input, uint32_t inState, int32_t inLen, const U<F> *pat,
              int32_t patLen, uint32_t options) {
  if (options & ~kParseOptions) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  const bool chars = !F::kUnits && (options & VL_OPT_CHARLEN);
  if (patLen == 0) {
    setRc(l, VL_RC_OK);
    return 0;
  }
  if (!t || !pat || (!input && inLen != 0)) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  F inF = f;
  inF.state = F::kShift ? inState : 0u;
  const uint32_t n = unitsFor(f, pat, patLen, chars);
  const uint32_t m = input ? unitsFor(inF, input, inLen, chars) : 0;
  Scan<F> x{ctxOf(l, f, (options & VL_OPT_DEFAULTS) != 0), t, In<F>{inF, input, 0, m}};
  uint32_t end = 0;
  uint32_t rc = scanWalk(x, pat, n, f.state, 0, &end);
  if (rc != VL_RC_OK) {
    setRc(l, rc);
    return -1;
  }
  if (x.afternoon == 1 && t->tm_hour < 12) t->tm_hour += 12;
  // The shift byte that brings the input to the state the pattern ends in belongs to it.
  if constexpr (F::kShift) {
    In<F> &in = x.in;
    if (in.f.state != end && in.pos < in.n && in.s[in.pos] == (end ? in.f.so : in.f.si)) in.f.shift(in.s[in.pos++]);
  }
  setRc(l, VL_RC_OK);
  return static_cast<int32_t>(chars ? countChars(inF, input, x.in.pos) : x.in.pos);
}

// The VLStrExtractTime family: one directive at *patPos, input at *pos.
template <class F>
uint32_t extractAt(VLLocale *l, F f, std::tm *t, int *afternoon, const U<F> *input, int32_t *pos, VLShiftState *state,
                   int32_t inLen, const U<F> *pat, int32_t *patPos, int32_t patLen, uint32_t options) {
  if ((options & ~VL_OPT_DEFAULTS) || !t || !input || !pos || !pat || !patPos || *pos < 0 || *patPos < 0)
    return setRc(l, VL_RC_BADARG);
  const uint32_t n = resolveLen(pat, patLen), m = resolveLen(input, inLen);
  uint32_t at = static_cast<uint32_t>(*patPos);
  if (at >= n || static_cast<uint32_t>(*pos) > m) return setRc(l, VL_RC_BADARG);
  F inF = f;
  inF.state = F::kShift && state ? *state : 0u;
  Scan<F> x{ctxOf(l, f, options != 0), t, In<F>{inF, input, static_cast<uint32_t>(*pos), m}};
  if (x.c.code(pat[at]) != kPercent) return setRc(l, VL_RC_BADPATTERN);
  uint32_t rc = extract(x, pat, n, &at, 0);
  if (rc == VL_RC_OK) {
    *pos = static_cast<int32_t>(x.in.pos);
    if (state) *state = x.in.f.state;
    *patPos = static_cast<int32_t>(at);
    if (afternoon && x.afternoon >= 0) *afternoon = x.afternoon;
  }
  return setRc(l, rc);
}

// The readers' input over the caller's text from *pos; null when the arguments are unusable.
template <class F>
bool inputAt(F f, const U<F> *input, int32_t *pos, const VLShiftState *state, int32_t len, In<F> *in) {
  if (!input || !pos || *pos < 0) return false;
  const uint32_t m = resolveLen(input, len);
  if (static_cast<uint32_t>(*pos) > m) return false;
  f.state = F::kShift && state ? *state : 0u;
  *in = In<F>{f, input, static_cast<uint32_t>(*pos), m};
  return true;
}

template <class F>
int32_t readNumberAt(uint32_t *error, F f, const U<F> *input, int32_t *pos, VLShiftState *state, int32_t len,
                     int32_t width, int32_t max, bool ascii) {
  In<F> in{};
  int32_t v = 0;
  uint32_t rc = VL_RC_NOTFOUND;
  if (width > 0 && inputAt(f, input, pos, state, len, &in)) {
    rc = readNumber(in, static_cast<U<F>>(ascii ? 0x30 : 0xF0), static_cast<uint32_t>(width), max, &v);
    if (rc == VL_RC_OK) {
      *pos = static_cast<int32_t>(in.pos);
      if (state) *state = in.f.state;
    }
  }
  if (error) *error = rc;
  return rc == VL_RC_OK ? v : -1;
}

template <class F>
uint32_t readWordAt(VLLocale *l, F f, int32_t *index, const U<F> *input, int32_t *pos, VLShiftState *state, int32_t len,
                    int32_t first, int32_t count, int32_t source) {
  In<F> in{};
  if ((source != 0 && source != 1) || !index || count < 0 || count > VL_ITEM_LAST || first < 0 ||
      first > VL_ITEM_LAST || !inputAt(f, input, pos, state, len, &in))
    return setRc(l, VL_RC_BADARG);
  int32_t k = 0;
  uint32_t rc = readWord(ctxOf(l, f, source == 1), in, first, count, &k);
  if (rc == VL_RC_OK) {
    *index = k;
    *pos = static_cast<int32_t>(in.pos);
    if (state) *state = in.f.state;
  }
  return setRc(l, rc);
}

}  // namespace vl::tf
