// Copy, concatenation, character search and tokenising, each written once over the
// forms of codepage/step.h. A Shifted form adds the Shift-Out/Shift-In rules; the other
// forms never see a shift byte, so those branches fold away.
#pragma once
#include <cstdint>
#include <algorithm>
#include <cstring>

#include "codepage/step.h"

namespace vl::str {

using namespace vl::step;

constexpr uint32_t kLast = 0x80000020u;

template <class T>
void moveUnits(T *dst, const T *src, uint32_t n) {
  if (n) std::memmove(dst, src, sizeof(T) * n);
}

// Copies whole characters of src into dst[0, dstLen). dstState is the state dst is in
// where the copy goes (Shifted only); f carries the state of src. With `chars` both
// lengths and the result count characters.
template <class F>
int32_t copy(F f, U<F> *dst, uint32_t dstState, int32_t dstLen, const U<F> *src, int32_t srcLen, bool chars) {
  if (!src || !dst || dstLen <= 0 || srcLen == 0) return 0;
  const F start = f;
  const uint32_t avail = srcLen < 0 ? length(src) + 1 : static_cast<uint32_t>(srcLen);
  uint32_t limit = 0;
  if (chars) {
    uint32_t have = srcLen < 0 ? countChars(f, src, avail) : avail;
    uint32_t n = have < static_cast<uint32_t>(dstLen) ? have : static_cast<uint32_t>(dstLen);
    limit = unitsOf(f, src, n, srcLen < 0 ? avail : UINT32_MAX);
  }

  // A copy that starts in another state than dst is in gets the shift byte between.
  uint32_t pre = 0, skip = 0;
  if constexpr (F::kShift) {
    if (dstState != f.state) {
      const uint8_t enter = f.state ? f.so : f.si;  // the byte that reaches src's state
      const uint8_t leave = f.state ? f.si : f.so;  // src opening with the way back
      if (src[0] == leave) {
        skip = 1;
        f.shift(leave);
      } else if (static_cast<uint32_t>(dstLen) < (f.state ? f.dbl + 1u : 2u)) {
        return 0;
      } else {
        dst[0] = enter;
        pre = 1;
      }
    }
  }
  const U<F> *s = src + skip;
  if (chars)
    limit = limit > skip ? limit - skip : 0;
  else
    limit = std::min(static_cast<uint32_t>(dstLen) - pre, avail - skip);

  uint32_t pos = limit;
  if (!f.singleByte()) {
    pos = 0;
    uint32_t kept = 0;  // end of the last whole character: the copy never ends on shift bytes
    while (pos < limit) {
      if constexpr (F::kShift) {
        if (f.isShift(s[pos])) {
          f.shift(s[pos++]);
          continue;
        }
      }
      uint32_t len = f.len(s + pos);
      if (len > limit - pos) break;
      pos += len;
      kept = pos;
    }
    pos = kept;
  }
  if (pos == 0) pre = 0;  // nor on the seam's shift byte alone
  moveUnits(dst + pre, s, pos);
  if (!chars) return static_cast<int32_t>(pre + pos);
  F counted = start;
  counted.state = dstState;
  return static_cast<int32_t>(countChars(counted, dst, pre + pos));
}

// Appends src to the 0-ended dst. f carries src's state, dstF dst's as passed.
template <class F>
int32_t cat(F f, F dstF, U<F> *dst, const U<F> *src, int32_t srcLen, uint32_t opts) {
  const bool chars = (opts & VL_OPT_CHARLEN) != 0;
  bool term = (opts & VL_OPT_NULLTERM) != 0;
  if (!dst) return 0;
  if (!src) srcLen = 0;
  if (chars && srcLen > 0) srcLen = static_cast<int32_t>(unitsOf(f, src, static_cast<uint32_t>(srcLen)));
  uint32_t dlen = length(dst);
  if (srcLen == 0) {
    // Counted with its terminator although nothing is written.
    if (!chars) return static_cast<int32_t>(dlen + 1);
    return static_cast<int32_t>(countChars(dstF, dst, F::kShift ? dlen : dlen + 1));
  }

  uint32_t dstCur = 0;
  if constexpr (F::kShift) {
    if (dlen && dst[dlen - 1] == f.si) {  // reopen the closed double-byte run
      --dlen;
      dstCur = 1;
    }
  }
  uint32_t n;
  if (srcLen < 0) {
    n = length(src);
    term = true;
  } else if (f.singleByte()) {
    n = static_cast<uint32_t>(srcLen);
  } else {
    Walk<F> w{f, src, static_cast<uint32_t>(srcLen)};
    uint32_t at, len;
    while (w.next(at, len)) {
    }
    n = w.pos;
  }

  if constexpr (F::kShift) {
    if (n && f.isShift(src[0])) {
      f.shift(src[0]);
      ++src;
      --n;
    }
    const bool seam = dstCur != f.state;
    if (seam) dst[dlen++] = f.state ? f.so : f.si;
    moveUnits(dst + dlen, src, n);
    // Never end on shift bytes, however many src ends with (nor on the seam's alone).
    while (n && f.isShift(dst[dlen + n - 1])) --n;
    uint32_t endState = dstCur;
    if (n) {
      Walk<F> w{f, dst + dlen, n};
      uint32_t at, len;
      while (w.next(at, len)) {
      }
      endState = w.f.state;
      dlen += n;
    } else if (seam) {
      --dlen;
    }
    if (term) {
      if (endState) dst[dlen++] = f.si;
      dst[dlen++] = 0;
    }
  } else {
    moveUnits(dst + dlen, src, n);
    dlen += n;
    if (term) dst[dlen++] = 0;
  }
  return static_cast<int32_t>(chars ? countChars(dstF, dst, dlen) : dlen);
}

// First (or with `last` the last) character of s[0, n) equal to c (clen units).
template <class F>
const U<F> *find(F f, const U<F> *s, uint32_t n, const U<F> *c, uint32_t clen, bool last, uint32_t *foundState) {
  if (f.singleByte() && !F::kShift) {
    if (!last) {
      if constexpr (sizeof(U<F>) == 1) return static_cast<const U<F> *>(std::memchr(s, *c, n));
      for (uint32_t i = 0; i < n; ++i)
        if (s[i] == *c) return s + i;
      return nullptr;
    }
    for (uint32_t i = n; i-- > 0;)
      if (s[i] == *c) return s + i;
    return nullptr;
  }
  const U<F> *hit = nullptr;
  Walk<F> w{f, s, n};
  uint32_t at, len;
  while (w.next(at, len)) {
    if (len == clen && std::memcmp(s + at, c, sizeof(U<F>) * len) == 0) {
      hit = s + at;
      if (foundState) *foundState = w.f.state;
      if (!last) break;
    }
  }
  return hit;
}

// The spans with lengths resolved; the result in units, or characters with `chars`.
template <bool kIn, class F>
int32_t spanOf(F f, const U<F> *s, int32_t len, F setF, const U<F> *set, int32_t setLen, bool chars) {
  if (!s) return 0;
  if (chars && len > 0) len = static_cast<int32_t>(unitsOf(f, s, static_cast<uint32_t>(len)));
  if (chars && setLen > 0 && set) setLen = static_cast<int32_t>(unitsOf(setF, set, static_cast<uint32_t>(setLen)));
  uint32_t n = resolveLen(s, len), m = set ? resolveLen(set, setLen) : 0;
  uint32_t r = span<kIn>(f, s, n, setF, set, m);
  return static_cast<int32_t>(chars ? countChars(f, s, r) : r);
}

// Splits off the next token of str; see VLStrtok. f and delimF carry the states of the
// string and the delimiters.
template <class F>
U<F> *tokenize(F f, F delimF, U<F> *str, int32_t *lenIO, const U<F> *delims, int32_t delimLen, U<F> **next,
               bool chars, uint32_t *tokenState, uint32_t *nextState) {
  if (next) *next = nullptr;
  int32_t len = lenIO ? *lenIO : 0;
  if (lenIO) *lenIO = 0;
  if (!str || !lenIO) return nullptr;
  if (chars && len > 0) len = static_cast<int32_t>(unitsOf(f, str, static_cast<uint32_t>(len)));
  if (chars && delimLen > 0 && delims)
    delimLen = static_cast<int32_t>(unitsOf(delimF, delims, static_cast<uint32_t>(delimLen)));
  uint32_t rest = resolveLen(str, len), dl = delims ? resolveLen(delims, delimLen) : 0;
  if (rest == 0) return nullptr;

  U<F> *token = str;
  SpanStop st{f.state, 0};
  uint32_t n = span<false>(f, token, rest, delimF, delims, dl, &st);
  if (st.lastEnd == 0 && n < rest) {  // no character before the first delimiter
    uint32_t skip = span<true>(f, token, rest, delimF, delims, dl, &st);
    rest -= skip;
    if (rest == 0) return nullptr;
    token += skip;
    f.state = st.state;
    n = span<false>(f, token, rest, delimF, delims, dl, &st);
  }
  if (tokenState) *tokenState = f.state;
  F d = f;
  d.state = st.state;
  if (n >= rest || d.len(token + n) > rest - n) return token;  // runs to the end

  // Blank the delimiter and any shift byte just before it: the token ends on a character.
  const uint32_t dlen = d.len(token + n);
  for (uint32_t i = st.lastEnd; i < n + dlen; ++i) token[i] = 0;
  rest -= n + dlen;
  if (rest > 0) {
    if (next) *next = token + n + dlen;
    if (nextState) *nextState = st.state;
    *lenIO = static_cast<int32_t>(chars ? countChars(d, token + n + dlen, rest) : rest);
  }
  return token;
}

// The byte span members: the option word, then one walk over the two strings' forms.
template <bool In, class F>
int32_t spanEntry(VLLocale *l, F strF, const char *str, int32_t len, F setF, const char *set, int32_t setLen,
                  uint32_t options) {
  if (options & ~VL_OPT_CHARLEN) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  setRc(l, VL_RC_OK);
  return spanOf<In>(strF, ub(str), len, setF, ub(set), setLen, options != 0);
}

}  // namespace vl::str
