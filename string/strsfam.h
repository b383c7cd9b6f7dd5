// Substring search, written once over the forms of codepage/step.h: exact, or with each
// candidate span confirmed by the collation comparison under the caller's options.
#pragma once
#include <cstdint>
#include <cstring>

#include "string/collfam.h"

namespace vl::strs {

using namespace vl::step;

constexpr uint32_t kAllowed = 0x80000000u | 0x40u | 0x01u;

// The first match of sub in str, or null. sf is the form (and state) sub starts in.
template <class F>
const U<F> *find(VLLocale *l, F f, const U<F> *str, int32_t len, F sf, const U<F> *sub, int32_t subLen,
                 uint32_t opts) {
  const bool chars = (opts & VL_OPT_CHARLEN) != 0;
  opts &= ~VL_OPT_CHARLEN;
  if (opts & ~kAllowed) {
    setRc(l, VL_RC_BADARG);
    return nullptr;
  }
  setRc(l, VL_RC_OK);
  if (!str || !sub) return nullptr;
  auto units = [&](F form, const U<F> *s, int32_t n) -> uint32_t {
    if (n < 0) return length(s);
    return chars && !F::kUnits ? unitsOf(form, s, static_cast<uint32_t>(n)) : static_cast<uint32_t>(n);
  };
  const uint32_t n = units(f, str, len), m = units(sf, sub, subLen);
  if (m == 0) return str;
  if (m > n) return nullptr;
  // The collation options the candidate spans are compared under (bit 0x01 drops trailing
  // blanks there).
  const uint32_t co = (opts & coll::kIgnoreWidth) == coll::kIgnoreWidth ? coll::kIgnoreWidth
                      : (opts & coll::kIgnoreCase) == coll::kIgnoreCase ? coll::kIgnoreCase
                                                                         : opts & 0x01u;
  // Candidates start at each character; exact matches also need the same shift state.
  Walk<F> w{f, str, n};
  uint32_t at, clen;
  for (;;) {
    F here = w.f;
    if (!w.next(at, clen)) return nullptr;
    if constexpr (F::kShift) here = w.f;
    if (at + m > n && !opts) return nullptr;
    if (!opts) {
      if ((!F::kShift || here.state == sf.state) && std::memcmp(str + at, sub, m * sizeof(U<F>)) == 0)
        return str + at;
      continue;
    }
    const uint32_t span = at + m <= n ? m : n - at;
    const int r = coll::coll(l, here, str + at, static_cast<int32_t>(span), sf, sub, static_cast<int32_t>(m), co);
    // A comparison that found no work area answers 0 without having compared.
    if (static_cast<uint32_t>(l->lastError) == VL_RC_NOMEM) return nullptr;
    if (r == 0) return str + at;
  }
}

}  // namespace vl::strs
