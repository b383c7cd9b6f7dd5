// Truncation to a length with trailing blanks dropped, written once over the byte forms
// of codepage/step.h. The Shifted form adds what a cut in the double-byte state needs.
#pragma once
#include <cstdint>
#include <cstring>

#include "codepage/step.h"

// Trace through the tracer of the calling member.
#define VL_TRC_AT(t, flag, ...)                                  \
  do {                                                           \
    if ((t).on(flag)) TRC1_Printf((t).record(), __VA_ARGS__);    \
  } while (0)

namespace vl::str {

using namespace vl::step;

constexpr uint32_t kTrimBlanks = 0x00800000u;   // VLTruncateString: drop trailing blanks
constexpr uint32_t kFoldWidth = 0x80000041u;    // with kTrimBlanks: full-width blanks too

// The single-byte blank of a page and, when asked for, its full-width form.
struct Blanks {
  uint8_t sb = 0x20;
  uint8_t fw[4] = {0, 0, 0, 0};
  uint32_t fwLen = 0;  // 0: full-width blanks are not dropped
};

inline Blanks blanksOf(const VLLocale *l, bool fullWidth) {
  Blanks b;
  b.sb = cp::isAscii(l->codePage) ? 0x20 : 0x40;
  if (fullWidth) {
    VLWChar w = VLCpMbHalfToFullW(l->codePage, b.sb);
    if (w && w != b.sb) b.fwLen = static_cast<uint32_t>(VLWToMb(b.fw, w));
    if (b.fwLen > 4) b.fwLen = 0;
  }
  return b;
}

// Cuts s (sl bytes before its 0) so that it and its terminator fit len bytes; len is
// above 0. Returns the bytes kept including the terminator, 0 when nothing was done.
template <class F>
int32_t truncate(F f, const Blanks &bl, uint8_t *s, uint32_t len, bool trim, Tracer &trc) {
  const uint32_t sl = length(s);
  if (sl < len) {
    len = sl + 1;
    if (!trim) return 0;
  }
  if (!F::kShift && f.singleByte()) {
    VL_TRC_AT(trc, TRC1_STATE, "Single byte code page, string length = %d", int(sl));
    while (trim && len > 1 && s[len - 2] == bl.sb) {
      VL_TRC_AT(trc, TRC1_STATE, "Stripping blank at position %d", int(len - 2));
      --len;
    }
    s[len - 1] = 0;
    return static_cast<int32_t>(len);
  }

  // Walk to the character that does not fit, noting where a run of blanks began.
  uint32_t p = 0, run = 0, runState = 0;
  for (;;) {
    if constexpr (F::kShift) {
      if (p < sl && p + 1 < len && f.isShift(s[p])) {
        f.shift(s[p++]);
        continue;
      }
    }
    const uint32_t clen = f.len(s + p);
    if (p >= sl || p + clen > sl || p + clen >= len) break;
    if (trim) {
      const bool sbBlank = clen == 1 && s[p] == bl.sb && (!F::kShift || f.state == 0);
      const bool fwBlank = bl.fwLen && clen == bl.fwLen && std::memcmp(s + p, bl.fw, clen) == 0 &&
                           (!F::kShift || f.state == 1);
      if (sbBlank || fwBlank) {
        if (!run) {
          run = p;
          runState = f.state;
          if (sbBlank)
            VL_TRC_AT(trc, TRC1_STATE, "Blank encountered at %d", int(p));
          else
            VL_TRC_AT(trc, TRC1_STATE, "Full width blank encountered at %d", int(p));
        }
      } else if (!(clen == 1 && s[p + 1] == 0)) {
        // A lone one-byte character before the end goes with the blanks before it.
        if (run) VL_TRC_AT(trc, TRC1_STATE, "Blank position reset");
        run = 0;
      }
    }
    p += clen;
  }
  uint32_t cut = p, state = f.state;
  if (run) {  // position 0 is no run: a string of blanks keeps them
    cut = run;
    state = runState;
    VL_TRC_AT(trc, TRC1_STATE, "Blank position set to %d", int(cut));
  }
  if constexpr (F::kShift) {
    if (state) {
      if (cut && s[cut - 1] == f.so) {
        --cut;
      } else {
        if (cut + 2 > len) {  // no room for the Shift-In: give up one double-byte character
          cut = cut >= f.dbl ? cut - f.dbl : 0;
          if (cut && s[cut - 1] == f.so) {
            --cut;
            state = 0;
          }
        }
        if (state && cut) s[cut++] = f.si;
      }
    }
  }
  s[cut] = 0;
  VL_TRC_AT(trc, TRC1_STATE, "index set to %d", int(cut));
  return static_cast<int32_t>(cut + 1);
}

// The entry of both byte members: the length in characters, the empty cut, the result.
template <class F>
int32_t truncateEntry(VLLocale *l, F f, char *str, int32_t len, uint32_t opts, Tracer &trc) {
  if (!str) return 0;
  uint8_t *s = ub(str);
  const bool chars = (opts & VL_OPT_CHARLEN) != 0;
  VL_TRC_AT(trc, TRC1_DETAIL, "Input length = %d", int(len));
  if (chars && len > 0) len = static_cast<int32_t>(unitsOf(f, s, static_cast<uint32_t>(len), length(s) + 1));
  if (len <= 0) {
    s[0] = 0;
    return 1;
  }
  const bool trim = (opts & kTrimBlanks) != 0;
  const Blanks bl = blanksOf(l, trim && (opts & kFoldWidth) == kFoldWidth);
  int32_t kept = truncate(f, bl, s, static_cast<uint32_t>(len), trim, trc);
  VL_TRC_AT(trc, 0x04, "Truncated string: %s", str);
  if (!chars || kept <= 0) return kept;
  return static_cast<int32_t>(countChars(f, s, static_cast<uint32_t>(kept)));
}

}  // namespace vl::str
