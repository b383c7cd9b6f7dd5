// Encoded text streams: character framing over the caller's transfer function, the
// push-back buffer, deferred writes and the string readers, written once for every member.
#pragma once
#include <cstring>

#include "codepage/step.h"

namespace vl::stm {

constexpr uint8_t kRead = 0, kWrite = 1;
constexpr uint32_t kCap = VL_STREAM_BUFSIZE;
constexpr VLWChar kNoChar = 0xFFFFFFFFu;

// How characters are framed in the stream's code page.
struct Page {
  const VLCodePage *cp = nullptr;
  const uint8_t *lenTab = nullptr;  // null: every character one byte
  bool shift = false;
  uint8_t so = 0, si = 0, dbl = 1;
  // Lengths are clamped to what a W value holds, whatever the table says.
  uint32_t lenOf(uint8_t lead) const {
    uint32_t n = lenTab ? lenTab[lead] : 1u;
    return n < 1 ? 1 : n > 4 ? 4 : n;
  }
  uint32_t lenIn(uint32_t state) const { return state ? dbl : 1u; }
  bool isShift(uint8_t b) const { return shift && (b == so || b == si); }
  uint8_t stateOf(uint8_t shiftByte) const { return shiftByte == so ? 1 : 0; }
  // Length of the character at the front of buffered bytes in the given state.
  uint32_t frontLen(const uint8_t *p, uint32_t state) const { return shift ? lenIn(state) : lenOf(*p); }
};

inline Page pageOf(const VLLocale *l) {
  Page pg;
  if (!l || !l->codePage || !l->codePage->section[0]) return pg;
  const VLCodePage *c = l->codePage;
  pg.cp = c;
  pg.lenTab = (l->flags & VL_LF_SINGLEBYTE) ? nullptr : cp::body(c) + cp::kLenTable;
  if (step::isShifted(l)) {
    pg.shift = true;
    pg.so = cp::shiftOut(c);
    pg.si = cp::shiftIn(c);
    uint8_t m = cp::maxLen(c);
    pg.dbl = static_cast<uint8_t>(m < 1 ? 1 : m > 4 ? 4 : m);
  }
  return pg;
}

// The handle an operation reports to, once the stream and its direction are checked;
// null when the operation cannot go on (the code is set where there is a handle).
// UTF-16 operations need no code page.
inline VLLocale *enter(VLStream *s, VLLocale *locale, uint8_t direction, bool needPage = true) {
  VLLocale *l = needPage ? step::use(locale) : orDefault(locale);
  if (!l) {
    setRc(orDefault(locale), VL_RC_BADARG);
    return nullptr;
  }
  if (!s || !s->transfer || s->direction > kWrite) {
    setRc(l, VL_RC_BADARG);
    return nullptr;
  }
  if (s->direction != direction) {
    setRc(l, VL_RC_STM_DIRECTION);
    return nullptr;
  }
  setRc(l, VL_RC_OK);
  return l;
}

// As enter, for the members given a pointer to a character.
inline VLLocale *enterChar(VLStream *s, VLLocale *locale, uint8_t direction, const char *chr) {
  VLLocale *l = enter(s, locale, direction);
  if (l && !chr) {
    setRc(l, VL_RC_BADARG);
    return nullptr;
  }
  return l;
}

inline int32_t transfer(VLStream *s, uint8_t *p, uint32_t n) {
  return s->transfer(s->handle, p, static_cast<int32_t>(n));
}
inline void drop(VLStream *s, uint32_t n) {
  s->count = static_cast<uint16_t>(s->count - n);
  std::memmove(s->buffer, s->buffer + n, s->count);
}

// ---- Reading --------------------------------------------------------------------------

enum class Fill { kDone, kEnd, kFailed, kNothing, kShiftByte };

// Reads `need` more bytes behind the buffered ones, repeating after short reads. A shift
// byte where the rest of a character was due loses that character (the buffer front);
// the shift byte and whatever came with it stay for the next read.
inline Fill fill(VLStream *s, const Page &pg, uint32_t need) {
  while (need) {
    uint8_t *at = s->buffer + s->count;
    int32_t r = transfer(s, at, need);
    if (r == -1) return Fill::kEnd;
    if (r < -1 || static_cast<uint32_t>(r) > need) return Fill::kFailed;
    if (r == 0) return Fill::kNothing;
    for (int32_t i = 0; i < r; ++i) {
      if (!pg.isShift(at[i])) continue;
      uint32_t keep = static_cast<uint32_t>(r - i);
      std::memmove(s->buffer, at + i, keep);
      s->count = static_cast<uint16_t>(keep);
      for (uint32_t k = 0; k < keep; ++k)
        if (pg.isShift(s->buffer[k])) s->state = pg.stateOf(s->buffer[k]);
      return Fill::kShiftByte;
    }
    s->count = static_cast<uint16_t>(s->count + r);
    need -= static_cast<uint32_t>(r);
  }
  return Fill::kDone;
}

// Takes the complete character of len bytes from the buffer front, and a shift byte
// behind it, which gives the state of the next buffered character.
inline VLWChar take(VLStream *s, const Page &pg, uint32_t len) {
  VLWChar v = cp::readW(s->buffer, len);
  drop(s, len);
  if (s->count && pg.isShift(s->buffer[0])) {
    s->bufState = pg.stateOf(s->buffer[0]);
    drop(s, 1);
  }
  return v;
}

// Completes the character at the buffer front. After a failure the bytes obtained stay
// buffered, so a later call can finish the character.
inline bool complete(VLStream *s, VLLocale *l, const Page &pg, uint32_t len, uint32_t failRc, VLWChar *out) {
  if (s->count < len) {
    switch (fill(s, pg, len - s->count)) {
      case Fill::kDone: break;
      case Fill::kEnd: setRc(l, VL_RC_STM_PARTIAL); return false;
      case Fill::kFailed: setRc(l, failRc); return false;
      default: setRc(l, VL_RC_STM_NOBYTE); return false;
    }
  }
  *out = take(s, pg, len);
  return true;
}

// The reading engine: false at the end of the data (code 0, or 61 inside a character)
// and on an error (code set).
inline bool readChar(VLStream *s, VLLocale *l, const Page &pg, VLWChar *out) {
  while (s->count && pg.isShift(s->buffer[0])) {
    s->bufState = pg.stateOf(s->buffer[0]);
    drop(s, 1);
  }
  if (s->count) return complete(s, l, pg, pg.frontLen(s->buffer, s->bufState), VL_RC_STM_READ, out);

  // Nothing buffered: one byte, passing shift bytes, then the rest of its character.
  bool shifted = false;
  uint8_t lastShift = 0;
  for (;;) {
    int32_t r = transfer(s, s->buffer, 1);
    if (r == -1) {
      // The data may end after Shift-In; after Shift-Out a double-byte run was due.
      setRc(l, shifted && lastShift != pg.si ? VL_RC_STM_PARTIAL : VL_RC_OK);
      return false;
    }
    if (r != 1) {
      setRc(l, VL_RC_STM_NOBYTE);
      return false;
    }
    if (!pg.isShift(s->buffer[0])) break;
    shifted = true;
    lastShift = s->buffer[0];
    s->state = pg.stateOf(lastShift);
  }
  s->count = 1;
  s->bufState = s->state;
  return complete(s, l, pg, pg.frontLen(s->buffer, s->state), shifted ? VL_RC_STM_NOBYTE : VL_RC_STM_READ, out);
}

// One unit of a UTF-16 stream through the work area; false at the end or on an error.
// A lone byte is kept, so the next call can complete the unit.
inline bool readUnit(VLStream *s, VLLocale *l, uint8_t *work, VLUChar *out) {
  auto fail = [&](int32_t r) {
    setRc(l, r == -1 ? VL_RC_OK : r == 0 ? VL_RC_STM_NOBYTE : VL_RC_STM_READ);
    return false;
  };
  if (s->count == 1) {
    int32_t r = transfer(s, work, 1);
    if (r == -1) return setRc(l, VL_RC_STM_PARTIAL), false;
    if (r != 1) return fail(r < -1 || r > 1 ? -2 : r);
    s->buffer[1] = work[0];
    s->count = 2;
  }
  if (s->count >= 2) {
    std::memcpy(out, s->buffer, 2);
    drop(s, 2);
    return true;
  }
  int32_t r = transfer(s, work, 2);
  if (r == 2) {
    std::memcpy(out, work, 2);
    return true;
  }
  if (r == 1) {
    s->buffer[0] = work[0];
    s->count = 1;
    return setRc(l, VL_RC_STM_READ), false;
  }
  return fail(r < -1 || r > 2 ? -2 : r);
}

// ---- Push-back --------------------------------------------------------------------------

// Puts a character in front of the buffered bytes. With a state (shift-sensitive pages)
// a shift byte goes between it and a buffered character of the other state.
inline int unget(VLStream *s, VLLocale *l, const Page &pg, const uint8_t *c, uint32_t len, int state) {
  uint32_t sep = 0;
  uint8_t sepByte = 0;
  if (state >= 0 && pg.shift && s->count && static_cast<uint32_t>(state) != s->bufState) {
    sep = 1;
    sepByte = s->bufState ? pg.so : pg.si;
  }
  if (s->count + len + sep > kCap) {
    setRc(l, VL_RC_BUFFER);
    return 0;
  }
  if (!s->count) s->bufState = s->state;  // the state the bytes most likely came in
  std::memmove(s->buffer + len + sep, s->buffer, s->count);
  std::memcpy(s->buffer, c, len);
  if (sep) s->buffer[len] = sepByte;
  s->count = static_cast<uint16_t>(s->count + len + sep);
  if (state >= 0 && pg.shift) s->bufState = static_cast<uint8_t>(state);
  return 1;
}

// A W value pushed back in the state its length implies.
inline int ungetW(VLStream *s, VLLocale *l, const Page &pg, VLWChar v) {
  uint8_t b[4];
  uint32_t n = static_cast<uint32_t>(cp::wToMb(b, v));
  return unget(s, l, pg, b, n, pg.shift ? (n > 1 ? 1 : 0) : -1);
}

// ---- Writing ----------------------------------------------------------------------------

inline bool refused(int32_t r, uint32_t asked) { return r <= 0 || static_cast<uint32_t>(r) > asked; }

// Sends the buffered bytes, then n more. Whatever the transfer function refuses waits in
// the buffer (65); a character that would overflow it is not taken at all (40).
inline uint32_t send(VLStream *s, const uint8_t *bytes, uint32_t n) {
  while (s->count) {
    int32_t r = transfer(s, s->buffer, s->count);
    if (refused(r, s->count)) {
      if (s->count + n > kCap) return VL_RC_BUFFER;
      std::memcpy(s->buffer + s->count, bytes, n);
      s->count = static_cast<uint16_t>(s->count + n);
      return VL_RC_STM_REFUSED;
    }
    drop(s, static_cast<uint32_t>(r));
  }
  uint32_t done = 0;
  while (done < n) {
    int32_t r = transfer(s, const_cast<uint8_t *>(bytes + done), n - done);
    if (refused(r, n - done)) {
      std::memcpy(s->buffer, bytes + done, n - done);
      s->count = static_cast<uint16_t>(n - done);
      return VL_RC_STM_REFUSED;
    }
    done += static_cast<uint32_t>(r);
  }
  return VL_RC_OK;
}

inline int written(VLLocale *l, uint32_t rc) { return setRc(l, rc) == VL_RC_OK ? 1 : 0; }

// A character of a shift-sensitive page, with the shift byte its state needs first.
inline int writeShifted(VLStream *s, VLLocale *l, const Page &pg, const uint8_t *c, bool dbl) {
  uint8_t b[5];
  uint32_t n = 0, len = dbl ? pg.dbl : 1u;
  uint8_t want = dbl ? 1 : 0;
  if (want != s->state) b[n++] = dbl ? pg.so : pg.si;
  std::memcpy(b + n, c, len);
  uint32_t rc = send(s, b, n + len);
  if (rc != VL_RC_BUFFER) s->state = want;
  return written(l, rc);
}

// ---- Strings ----------------------------------------------------------------------------

enum class Form { kPlain, kEx, kW, kU };
constexpr uint32_t kReadOpts = step::kEolKinds | VL_OPT_NULLTERM | VL_OPT_CHARLEN | VL_OPT_STRIPEOL;

// Reads characters up to a line end of the wanted kinds, the end of the data or a full
// output. The byte forms store code page bytes (the Ex form with shift bytes), W stores
// W values, U reads a UTF-16 stream.
template <Form K, class T>
int32_t readString(VLStream *s, VLLocale *locale, T *out, int32_t size, uint32_t opts, VLShiftState *stateIO) {
  constexpr bool kBytes = K == Form::kPlain || K == Form::kEx;
  VLLocale *l = enter(s, locale, kRead, K != Form::kU);
  if (!l) return -2;
  if ((opts & ~kReadOpts) || !out) {
    setRc(l, VL_RC_BADARG);
    return -2;
  }
  const Page pg = K == Form::kU ? Page{} : pageOf(l);
  const step::EolChars e = K == Form::kU ? step::kEolU : step::eolOf(pg.cp);
  const bool term = (opts & VL_OPT_NULLTERM) != 0, strip = (opts & VL_OPT_STRIPEOL) != 0;
  const bool byChars = kBytes && (opts & VL_OPT_CHARLEN);
  const bool exShift = K == Form::kEx && pg.shift;
  if (size <= 0) return 0;
  const uint32_t cap = static_cast<uint32_t>(size) - (term ? 1u : 0u);
  uint32_t st = stateIO && *stateIO ? 1u : 0u;
  uint32_t used = 0, chars = 0, crAt = 0;
  bool prevCr = false, any = false, ended = false;
  Block<uint8_t> work(K == Form::kU ? static_cast<uint8_t *>(alloc(2)) : nullptr);
  if (K == Form::kU && !work) {
    setRc(l, VL_RC_NOMEM);
    return -2;
  }
  while ((byChars ? chars : used) < cap || (strip && prevCr)) {
    VLWChar v;
    if constexpr (K == Form::kU) {
      VLUChar u;
      if (!readUnit(s, l, work.get(), &u)) {
        ended = true;
        break;
      }
      v = u;
    } else {
      if (!readChar(s, l, pg, &v)) {
        ended = true;
        break;
      }
    }
    any = true;
    uint8_t mb[4];
    uint32_t n = 1;
    if constexpr (kBytes) n = static_cast<uint32_t>(cp::wToMb(mb, v));
    const bool one = kBytes ? n == 1 : (K == Form::kU || v < 0x100);
    const bool crlf = (opts & VL_EOL_CRLF) && one && prevCr && v == e.lf;
    const bool eol = crlf || (one && (((opts & VL_EOL_LF) && v == e.lf) || ((opts & VL_EOL_LS) && v == e.ls) ||
                                      ((opts & VL_EOL_PS) && v == e.ps)));
    if (eol && strip) {
      if (crlf) used = crAt, --chars;
      break;
    }
    // A removable line feed may still follow a carriage return stored in the last place.
    const uint32_t nextSt = exShift ? (n > 1 ? 1u : 0u) : st;
    const uint32_t need = n + (exShift && nextSt != st ? 1u : 0u);
    const uint32_t closing = exShift && term && nextSt ? 1u : 0u;
    if (byChars ? chars >= cap : used + need + closing > cap) {
      if constexpr (K == Form::kU) {
        VLUChar u = static_cast<VLUChar>(v);
        unget(s, l, pg, reinterpret_cast<uint8_t *>(&u), 2, -1);
      } else {
        ungetW(s, l, pg, v);
      }
      setRc(l, VL_RC_OK);
      break;
    }
    if constexpr (kBytes) {
      if (need > n) out[used++] = static_cast<char>(nextSt ? pg.so : pg.si);
      std::memcpy(out + used, mb, n);
    } else {
      out[used] = static_cast<T>(v);
    }
    st = nextSt;
    used += n;
    ++chars;
    prevCr = one && v == e.cr;
    crAt = used - 1;
    if (eol) break;
  }
  if (l->lastError != VL_RC_OK) return any ? static_cast<int32_t>(byChars ? chars : used) : -2;
  if (ended && !any) {
    if (term) out[0] = 0;
    return -1;
  }
  if (term) {
    if (exShift && st) out[used++] = static_cast<char>(pg.si), st = 0;
    out[used++] = 0;
    ++chars;
  }
  if (stateIO) *stateIO = st;
  return static_cast<int32_t>(byChars ? chars : used);
}

}  // namespace vl::stm
