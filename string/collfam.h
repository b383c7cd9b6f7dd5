// Collation, written once over the forms of codepage/step.h: stepping a string into
// collation elements, placing weights into the four level buffers, sort keys, and the
// comparison with early primary decision.
#pragma once
#include <cstdint>
#include <cstring>
#include <iterator>
#include <utility>

#include "codepage/step.h"
#include "store/store.h"
#include "string/compare.h"
#include "string/sortbody.h"

namespace vl::coll {

using namespace vl::step;
using sort::Element;
using sort::Weights;

constexpr uint32_t kGrain = 8;  // granularity of the work area's parts
constexpr uint32_t kNoUnit = 0xFFFF;
constexpr uint32_t kIgnoreCase = 0x80000040u, kIgnoreWidth = 0x80000041u;

inline uint32_t roundUp(uint32_t n) { return (n + kGrain - 1) & ~(kGrain - 1); }
// Work area of one string of count units: two elements per unit on every level.
inline uint32_t workSize(uint32_t count) { return roundUp(roundUp(count * 8 + 3) + count * 8); }

inline bool usesSort(const VLLocale *l) {
  return l->sort && l->sort->section[0] && !(l->flags & VL_LF_BINARY);
}

// Appends n values at *end (the mark follows) when forward, else inserts them at *mark.
template <class T>
void placeRun(T **mark, T **end, const T *v, uint32_t n, bool forward) {
  if (!forward) std::memmove(*mark + n, *mark, static_cast<size_t>(*end - *mark) * sizeof(T));
  std::memcpy(forward ? *end : *mark, v, n * sizeof(T));
  *end += n;
  if (forward) *mark = *end;
}

// The four level buffers of one string. The fourth level holds (position, weight) pairs.
struct Levels {
  uint16_t *p = nullptr;
  uint8_t *s = nullptr, *t = nullptr;
  uint16_t *q = nullptr;
  uint32_t pn = 0, pm = 0, sn = 0, sm = 0, tn = 0, tm = 0, qn = 0, qm = 0;  // ends and marks
  uint32_t qSkip = 0;  // 16-bit values left off the front of the fourth level
  bool noTertiary = false;

  void init(uint8_t *area, uint32_t count) {
    p = reinterpret_cast<uint16_t *>(area);
    // One byte of slack before each part lets the key be written over the buffers in order.
    s = area + count * 4 + 1;
    t = area + count * 6 + 2;
    q = reinterpret_cast<uint16_t *>(area + roundUp(count * 8 + 3));
  }
  template <class T>
  static void place(T *buf, uint32_t &end, uint32_t &mark, const T *v, uint32_t n, bool forward) {
    T *m = buf + mark, *e = buf + end;
    placeRun(&m, &e, v, n, forward);
    mark = static_cast<uint32_t>(m - buf);
    end = static_cast<uint32_t>(e - buf);
  }
  // A weight whose level lacks the forward bit goes in at the mark, so a run of them
  // comes out reversed between forward-placed weights.
  void insert(const Element &e, uint16_t pos, uint8_t cls) {
    if (e.primary) place(p, pn, pm, &e.primary, 1, (cls & sort::kFwdPrimary) != 0);
    if (e.secondary) place(s, sn, sm, &e.secondary, 1, (cls & sort::kFwdSecondary) != 0);
    if (e.tertiary && !noTertiary) place(t, tn, tm, &e.tertiary, 1, (cls & sort::kFwdTertiary) != 0);
    if (e.fourth) {
      const uint16_t pair[2] = {pos, e.fourth};
      place(q, qn, qm, pair, 2, (cls & sort::kFwdFourth) != 0);
    }
  }
  void insertAll(const Weights &w, int n, uint16_t pos) {
    for (int i = 0; i < n; ++i) insert(w.e[i], pos, w.cls);
  }
  // Trailing default secondaries and tertiaries leave; a key with nothing on the first
  // three levels starts its fourth level one value late.
  void finish(const VLObjEntry *sortObj) {
    const uint8_t *b = sort::body(sortObj);
    while (sn && s[sn - 1] == b[sort::kDefSec]) --sn;
    while (tn && t[tn - 1] == b[sort::kDefTer]) --tn;
    qSkip = (!pn && !sn && !tn && qn) ? 1 : 0;
  }
  uint32_t keyLength() const { return pn * 2 + sn + tn + (qn - qSkip) * 2 + 3; }
  // Writes the key at dst (which may overlap the buffers from below).
  void write(uint8_t *dst) const {
    uint8_t *o = dst;
    for (uint32_t i = 0; i < pn; ++i, o += 2) {
      const uint16_t v = p[i];
      o[0] = static_cast<uint8_t>(v >> 8);
      o[1] = static_cast<uint8_t>(v);
    }
    *o++ = 0;
    std::memmove(o, s, sn);
    o += sn;
    *o++ = 0;
    std::memmove(o, t, tn);
    o += tn;
    *o++ = 0;
    for (uint32_t i = qSkip; i < qn; ++i, o += 2) {
      const uint16_t v = q[i];
      o[0] = static_cast<uint8_t>(v >> 8);
      o[1] = static_cast<uint8_t>(v);
    }
  }
};

// Byte-wise order of two runs of 16-bit values written big-endian, then by length.
inline int cmp16(const uint16_t *a, uint32_t an, const uint16_t *b, uint32_t bn) {
  for (uint32_t i = 0; i < an && i < bn; ++i)
    if (a[i] != b[i]) return a[i] < b[i] ? -1 : 1;
  return an == bn ? 0 : an < bn ? -1 : 1;
}
inline int cmp8(const uint8_t *a, uint32_t an, const uint8_t *b, uint32_t bn) {
  const int c = std::memcmp(a, b, an < bn ? an : bn);
  if (c) return c < 0 ? -1 : 1;
  return an == bn ? 0 : an < bn ? -1 : 1;
}
// The order of the two keys these levels would write, without writing them.
inline int compare(const Levels &a, const Levels &b) {
  if (int c = cmp16(a.p, a.pn, b.p, b.pn)) return c;
  if (int c = cmp8(a.s, a.sn, b.s, b.sn)) return c;
  if (int c = cmp8(a.t, a.tn, b.t, b.tn)) return c;
  return cmp16(a.q + a.qSkip, a.qn - a.qSkip, b.q + b.qSkip, b.qn - b.qSkip);
}

// Reads the characters of one string in form F as UTF-16 units and hands out its
// collation elements, trying each unit with the next for a combination.
template <class F>
struct Source {
  F f;
  const VLCodePage *cp;
  const VLObjEntry *so;
  const U<F> *p;
  uint32_t rem;          // units of the string left
  uint32_t counter = 0;  // characters read
  uint32_t pending = kNoUnit;
  uint32_t pendingLen = 0;

  // One character as a unit; false at the end or at a character cut by the length.
  bool read(uint16_t *u, uint32_t *len) {
    if constexpr (F::kShift) {
      while (rem && f.isShift(*p)) {
        f.shift(*p++);
        --rem;
      }
    }
    if (!rem) return false;
    if (f.len(p) > rem) {
      rem = 0;
      return false;
    }
    peek(u, len);
    p += *len;
    rem -= *len;
    ++counter;
    return true;
  }

  // The unit of the whole character at p (rem is not 0 and it fits), and its length.
  uint16_t peek(uint16_t *u, uint32_t *len) const {
    if constexpr (F::kUnits) {
      *len = 1;
      if constexpr (sizeof(U<F>) == 2)
        *u = *p;
      else
        *u = *p < 0x100 ? cp::sbcsUni(cp, static_cast<uint8_t>(*p)) : cp::wToUni(cp, *p);
    } else {
      *len = f.len(p);
      *u = *len == 1 ? cp::sbcsUni(cp, *p) : cp::mbToUni(cp, p, *len);
    }
    return *u;
  }

  // The next element (0 = none: ignorable, or the end when done() says so). pos gets the
  // 1-based position of its first character.
  int next(Weights *w, uint16_t *pos) {
    uint16_t u;
    uint32_t len;
    if (pending != kNoUnit) {
      u = static_cast<uint16_t>(pending);
      pending = kNoUnit;
      *pos = static_cast<uint16_t>(counter);
    } else {
      if (!read(&u, &len)) {
        *w = Weights{};
        return 0;
      }
      *pos = static_cast<uint16_t>(counter);
    }
    if (sort::hasCombinations(so)) {
      uint16_t v;
      if (read(&v, &len)) {
        if (sort::combinationOf(so, u, v, w)) return 1;
        pending = v;
        *pos = static_cast<uint16_t>(counter - 1);
      }
    }
    return sort::weightsOf(so, u, w);
  }
  bool done() const { return pending == kNoUnit && rem == 0; }
};

// Walks both strings at once, deciding on the first primary difference while every
// primary so far was placed forward; otherwise compares the finished levels.
template <class F>
int compareWalk(Source<F> a, Source<F> b, Levels &la, Levels &lb) {
  bool early = true;
  Weights wa, wb;
  int na = 0, nb = 0, ia = 0, ib = 0;  // elements of the current unit, and the one up
  uint16_t pa = 0, pb = 0;
  auto pull = [&](Source<F> &s, Weights &w, int &n, int &i, uint16_t &pos) {
    // The next element with weights, or false at the end.
    for (;;) {
      if (i + 1 < n) {
        ++i;
        return true;
      }
      if (s.done()) return false;
      n = s.next(&w, &pos);
      i = 0;
      if (n) return true;
    }
  };
  bool haveA = pull(a, wa, na, ia, pa), haveB = pull(b, wb, nb, ib, pb);
  while (haveA || haveB) {
    const Element *ea = haveA ? &wa.e[ia] : nullptr;
    const Element *eb = haveB ? &wb.e[ib] : nullptr;
    if (early && ((ea && ea->primary && !(wa.cls & sort::kFwdPrimary)) ||
                  (eb && eb->primary && !(wb.cls & sort::kFwdPrimary))))
      early = false;
    const bool primA = ea && ea->primary, primB = eb && eb->primary;
    if (early) {
      if (primA && primB && ea->primary != eb->primary) return ea->primary < eb->primary ? -1 : 1;
      if (primA && !haveB) return 1;
      if (primB && !haveA) return -1;
    }
    // Align on primary-bearing elements: one without a primary moves alone.
    const bool stepA = haveA && (!primA || primB || !haveB);
    const bool stepB = haveB && (!primB || primA || !haveA);
    if (stepA) {
      la.insert(*ea, pa, wa.cls);
      haveA = pull(a, wa, na, ia, pa);
    }
    if (stepB) {
      lb.insert(*eb, pb, wb.cls);
      haveB = pull(b, wb, nb, ib, pb);
    }
  }
  la.finish(a.so);
  lb.finish(b.so);
  if (early) la.pn = lb.pn = 0;  // equal: both walked every primary alike
  return compare(la, lb);
}

// ---- The shortcut of typical comparisons --------------------------------------------
// Most pairs differ in a primary weight near their first difference. For sorts that place
// every primary forward, the walk starts past the common beginning of both strings and
// decides at the first primary difference without placing a weight; only pairs whose
// primaries are all equal take the full walk over the level buffers.

constexpr uint16_t kLookUp = 0xFFFF;  // a character the table cannot answer alone

// Per sort and code page: the primary weight of each one-unit character below 0x100
// (0 = none, kLookUp = it expands, starts a combination or weighs 0xFFFF), and whether
// any primary is placed backward (then no shortcut holds).
struct Quick {
  const VLObjEntry *so = nullptr;
  const void *body = nullptr;
  const VLCodePage *page = nullptr;
  const uint8_t *lenTab = nullptr;  // the plain form's, null in a single-byte page
  uint32_t unloads = 0;
  bool backward = false;
  bool utf8 = false;
  uint64_t startBlocks[4] = {};  // high bytes in which some combination starts
  uint64_t lowStarts[4] = {};    // units below 0x100 that start one
  uint16_t byByte[256] = {};     // one-byte characters of the page, and W values below 0x100
  uint16_t byUnit[256] = {};     // UTF-16 units
  uint16_t byLead[256] = {};     // byByte for the bytes the plain form reads as whole characters

  // The table's answer for a string's first unit, kLookUp when it has none.
  // Two-byte UTF-8 below U+0100 reads through the unit table.
  template <class F>
  uint16_t first(F, const U<F> *p, uint32_t n) const {
    if constexpr (F::kShift) return kLookUp;
    if constexpr (!F::kUnits) {
      if (utf8 && (*p & 0xFE) == 0xC2 && n >= 2) return byUnit[(*p & 0x03) << 6 | (p[1] & 0x3F)];
      return byLead[*p];
    }
    if (*p >= 0x100) return kLookUp;
    return (sizeof(U<F>) == 2 ? byUnit : byByte)[*p];
  }
  static bool forwardPrimary(uint16_t flags) { return ((flags & sort::kClassMask) >> 10) & sort::kFwdPrimary; }
  bool starts(uint16_t u) const {
    if (u < 0x100) return (lowStarts[u >> 6] >> (u & 63)) & 1;
    return ((startBlocks[u >> 14] >> ((u >> 8) & 63)) & 1) && sort::startsCombination(so, u);
  }
  uint16_t entryOf(uint16_t u) const {
    if (starts(u)) return kLookUp;
    Weights w;
    const int n = sort::weightsOf(so, u, &w);
    return n == 2 ? kLookUp : n == 1 ? w.e[0].primary : 0;
  }
  void build(const VLObjEntry *sortObj, const void *b, const VLCodePage *c, const uint8_t *lens, uint32_t gen) {
    so = sortObj, body = b, page = c, lenTab = lens, unloads = gen;
    utf8 = cp::isUtf8(c);
    backward = false;
    const auto *bd = static_cast<const uint8_t *>(b);
    for (uint32_t i = 0; i < 4; ++i) startBlocks[i] = lowStarts[i] = 0;
    const uint8_t *comb = bd + rd16(bd + sort::kCombOff);
    for (uint32_t i = 0, n = rd16(bd + sort::kCombCount); i < n; ++i) {
      const uint16_t u = rd16(comb + sort::kCombSize * i);
      startBlocks[u >> 14] |= uint64_t{1} << ((u >> 8) & 63);
      if (u < 0x100) lowStarts[u >> 6] |= uint64_t{1} << (u & 63);
      const uint16_t f = rd16(comb + sort::kCombSize * i + 8);
      if (!(f & sort::kFourth) && rd16(comb + sort::kCombSize * i + 4) && !forwardPrimary(f)) backward = true;
    }
    // Every weight table entry a block reaches, and the arithmetic primary blocks.
    const uint8_t *table = bd + rd16(bd + sort::kWeightOff);
    uint32_t lastBase = UINT32_MAX;
    for (uint32_t hi = 0; hi < 256 && !backward; ++hi) {
      const uint8_t *blk = bd + sort::kBlocks + 4 * hi;
      if (blk[0] & sort::kBlockIgnore) continue;
      if (blk[0] & sort::kBlockPrimary) {
        backward = !(blk[1] & sort::kFwdPrimary);
        continue;
      }
      if ((blk[0] & sort::kBlockFourth) || rd16(blk + 2) == lastBase) continue;
      lastBase = rd16(blk + 2);
      for (uint32_t lo = 0; lo < 256 && !backward; ++lo) {
        const uint8_t *e = table + sort::kWeightSize * static_cast<uint16_t>(lastBase + lo);
        const uint16_t f = rd16(e + 4);
        const bool primary = (f & sort::kExpands) || (!(f & sort::kFourth) && rd16(e));
        backward = primary && !forwardPrimary(f);
      }
    }
    for (uint32_t v = 0; v < 256; ++v) {
      byByte[v] = entryOf(cp::sbcsUni(c, static_cast<uint8_t>(v)));
      byLead[v] = !lens || lens[v] == 1 ? byByte[v] : kLookUp;
      byUnit[v] = entryOf(static_cast<uint16_t>(v));
    }
  }
};

// Building walks the sort's tables, so each thread keeps the last few and rebuilds one
// when the sort, its body, the code page or the store's unload count changes.
struct QuickKey {
  const VLObjEntry *so;
  const void *body;
  const VLCodePage *page;
  const uint8_t *lenTab;
  uint32_t unloads;
  bool operator==(const QuickKey &) const = default;
};
[[gnu::noinline]] inline const Quick *quickFind(const QuickKey &k) {
  constexpr unsigned kKept = 4;
  static thread_local Quick kept[kKept];
  static thread_local unsigned victim = 0;
  for (Quick &q : kept)
    if (QuickKey{q.so, q.body, q.page, q.lenTab, q.unloads} == k) return &q;
  Quick &q = kept[victim++ % kKept];
  q.build(k.so, k.body, k.page, k.lenTab, k.unloads);
  return &q;
}
// The last one found sits beside its key, so a repeated call only compares.
inline const Quick &quickOf(const VLLocale *l) {
  // One thread-local record, so the shared library looks its address up once a call.
  struct Last {
    QuickKey key;
    const Quick *quick;
  };
  static thread_local Last last{};
  const QuickKey k{l->sort, __atomic_load_n(&l->sort->section[0], __ATOMIC_ACQUIRE), l->codePage,
                   bytesOf(l).lenTab, store::unloads.load(std::memory_order_acquire)};
  Last &t = last;
  if (!t.quick || !(k == t.key)) {
    t.quick = quickFind(k);
    t.key = k;
  }
  return *t.quick;
}

// Key of count UTF-16 units into dst by the sort of q; builds in dst when it holds the work area. Returns
// the key length (also when it did not fit, and nothing was written), -1 without memory.
inline int32_t genKey(const Quick &q, uint8_t *dst, uint32_t dstLen, const uint16_t *u, uint32_t count,
                      bool noTertiary = false) {
  const VLObjEntry *so = q.so;
  if (!dst) dstLen = 0;
  if (count == 0) {
    if (dstLen > 2) std::memset(dst, 0, 3);
    return 3;
  }
  const uint32_t need = workSize(count);
  const uint32_t skip = dst ? (kGrain - reinterpret_cast<uintptr_t>(dst) % kGrain) % kGrain : 0;
  const bool inPlace = dstLen > skip && dstLen - skip >= need;
  Block<uint8_t> own(inPlace ? nullptr : static_cast<uint8_t *>(alloc(need)));
  if (!inPlace && !own) return -1;
  uint8_t *area = inPlace ? dst + skip : own.get();
  Levels lv;
  lv.init(area, count);
  lv.noTertiary = noTertiary;
  Weights w;
  for (uint32_t i = 0; i < count; ++i) {
    const auto pos = static_cast<uint16_t>(i + 1);
    // Only a unit that starts some combination is tried with the next (most start none).
    if (i + 1 < count && q.starts(u[i]) && sort::combinationOf(so, u[i], u[i + 1], &w)) {
      lv.insertAll(w, 1, pos);
      ++i;
      continue;
    }
    lv.insertAll(w, sort::weightsOf(so, u[i], &w), pos);
  }
  lv.finish(so);
  const uint32_t len = lv.keyLength();
  if (len <= dstLen) {
    lv.write(dst);
    if (inPlace) std::memset(dst + len, 0, dstLen - len);
  }
  return static_cast<int32_t>(len);
}

// The primary weights of one string, one at a time: one-unit characters below 0x100
// through the table, everything else through the full element walk.
template <class F>
struct Primaries {
  Source<F> src;
  const Quick &q;
  uint16_t second = 0;  // primary of an expansion's second element

  // The next primary weight; 0 at the end.
  [[gnu::always_inline]] uint16_t next() {
    if (second) return std::exchange(second, 0);
    for (;;) {
      if (src.pending == kNoUnit) {
        if constexpr (F::kShift) {
          while (src.rem && src.f.isShift(*src.p)) {
            src.f.shift(*src.p++);
            --src.rem;
          }
        }
        if (!src.rem) return 0;
        uint32_t n = 1;
        uint16_t k = kLookUp;
        if constexpr (F::kShift) {
          n = src.f.len(src.p);
          if (n > src.rem) return 0;
          if (n == 1) k = q.byByte[*src.p];
        } else {
          k = q.first(src.f, src.p, src.rem);
          if (!F::kUnits && q.utf8 && *src.p >= 0xC2) n = 2;  // only C2 and C3 get past kLookUp there
        }
        if (k != kLookUp) {
          src.p += n;
          src.rem -= n;
          if (k) return k;
          continue;
        }
      }
      if (src.done()) return 0;
      if (const uint16_t k = lookUp()) return k;
    }
  }

  // The primary of the next element through the sort's tables, 0 when it has none.
  [[gnu::noinline]] uint16_t lookUp() {
    Weights w;
    int n;
    uint16_t u;
    uint32_t len;
    // A character that starts no combination needs no look-ahead; one of several bytes
    // may still be a unit of the table.
    if (src.pending == kNoUnit && !q.starts(src.peek(&u, &len))) {
      src.p += len;
      src.rem -= len;
      if (u < 0x100 && q.byUnit[u] != kLookUp) return q.byUnit[u];
      n = sort::weightsOf(src.so, u, &w);
    } else {
      uint16_t pos;
      n = src.next(&w, &pos);
    }
    const uint16_t p0 = n ? w.e[0].primary : 0, p1 = n == 2 ? w.e[1].primary : 0;
    if (p0) second = p1;
    return p0 ? p0 : p1;
  }
};

// The unit count both strings share at their start, cut back to a boundary the walk of
// either string also reaches: a whole character that does not start a combination. fa
// gets the state there.
template <class F>
uint32_t commonStart(const Quick &q, const VLCodePage *c, F &fa, const U<F> *a, uint32_t an, F fb, const U<F> *b,
                     uint32_t bn) {
  if (fa.state != fb.state) return 0;
  const uint32_t m = an < bn ? an : bn;
  uint32_t d = 0;
  while (d < m && a[d] == b[d]) ++d;
  if (!d) return 0;
  auto startsAt = [&](const U<F> *p, uint32_t n) {
    if (n == 1 && static_cast<uint32_t>(*p) < 0x100) {
      const uint16_t k = (F::kUnits && sizeof(U<F>) == 2 ? q.byUnit : q.byByte)[*p];
      return k == kLookUp && q.starts(F::kUnits && sizeof(U<F>) == 2 ? *p : cp::sbcsUni(c, static_cast<uint8_t>(*p)));
    }
    if constexpr (F::kUnits)
      return q.starts(sizeof(U<F>) == 2 ? static_cast<uint16_t>(*p) : cp::wToUni(c, *p));
    else
      return q.starts(cp::mbToUni(c, p, n));
  };
  if (F::kUnits || (!F::kShift && fa.singleByte())) {
    while (d && startsAt(a + d - 1, 1)) --d;
    return d;
  }
  // Character ends in order, with the state after each; the last few are kept to back up.
  constexpr uint32_t kBack = 4;
  uint32_t ends[kBack], states[kBack], lens[kBack], k = 0;
  Walk<F> w{fa, a, d};
  uint32_t at, len;
  while (w.next(at, len)) {
    ends[k % kBack] = at + len, states[k % kBack] = w.f.state, lens[k % kBack] = len;
    ++k;
  }
  for (uint32_t i = 0; i < kBack && k; ++i, --k) {
    const uint32_t j = (k - 1) % kBack;
    if (!startsAt(a + ends[j] - lens[j], lens[j])) {
      fa.state = states[j];
      return ends[j];
    }
  }
  return 0;
}

// The order of the first primary difference, or 2 when every primary is equal.
template <class F>
[[gnu::always_inline]] inline int comparePrimaries(Primaries<F> &a, Primaries<F> &b) {
  for (;;) {
    const uint16_t pa = a.next(), pb = b.next();
    if (pa != pb) return pa < pb ? -1 : 1;
    if (!pa) return 2;
  }
}

}  // namespace vl::coll

namespace vl::coll {

// Case and width distinctions live on the tertiary level of the generated sorts, so the
// case- and width-blind options leave that level out.
inline bool optionsOk(uint32_t o) { return o == 0 || o == kIgnoreCase || o == kIgnoreWidth; }

template <class F>
[[gnu::always_inline]] inline uint32_t unitLen(F f, const U<F> *s, int32_t len, uint32_t opts) {
  if (len < 0) return length(s);
  if ((opts & VL_OPT_CHARLEN) && !F::kUnits) return unitsOf(f, s, static_cast<uint32_t>(len));
  return static_cast<uint32_t>(len);
}

// Binary order: the units themselves, big-endian.
template <class T>
int32_t binaryKey(uint8_t *dst, uint32_t dstLen, const T *s, uint32_t n) {
  const uint32_t len = n * static_cast<uint32_t>(sizeof(T) == 1 ? 1 : 2);
  if (len <= dstLen) {
    for (uint32_t i = 0; i < n; ++i) {
      if constexpr (sizeof(T) == 1)
        dst[i] = s[i];
      else
        dst[2 * i] = static_cast<uint8_t>(s[i] >> 8), dst[2 * i + 1] = static_cast<uint8_t>(s[i]);
    }
  }
  return static_cast<int32_t>(len);
}

// Equal primaries: the full walk over the four level buffers of both strings, in a work
// area on the stack for typical words.
template <class F>
int compareLevels(VLLocale *l, F fa, const U<F> *a, uint32_t an, F fb, const U<F> *b, uint32_t bn, bool noTertiary) {
  const uint32_t na = workSize(an ? an : 1), nb = workSize(bn ? bn : 1);
  alignas(8) uint8_t stack[2048];
  const bool onStack = na + nb <= sizeof stack;
  Block<uint8_t> own(onStack ? nullptr : static_cast<uint8_t *>(alloc(na + nb)));
  if (!onStack && !own) {
    setRc(l, VL_RC_NOMEM);
    return 0;
  }
  uint8_t *area = onStack ? stack : own.get();
  Levels la, lb;
  la.init(area, an ? an : 1);
  lb.init(area + na, bn ? bn : 1);
  la.noTertiary = lb.noTertiary = noTertiary;
  return compareWalk(Source<F>{fa, l->codePage, l->sort, a, an}, Source<F>{fb, l->codePage, l->sort, b, bn}, la, lb);
}

template <class F>
int32_t xfrm(VLLocale *l, F f, uint8_t *dst, int32_t dstLen, const U<F> *src, int32_t srcLen, uint32_t opts) {
  opts &= ~VL_OPT_CHARLEN;
  if (!optionsOk(opts) || !src) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  const uint32_t room = dst && dstLen > 0 ? static_cast<uint32_t>(dstLen) : 0;
  const uint32_t n = srcLen < 0 ? length(src) : static_cast<uint32_t>(srcLen);
  setRc(l, VL_RC_OK);
  if (!usesSort(l)) return binaryKey(dst, room, src, n);
  if (n == 0) {
    if (room) std::memset(dst, 0, room < 3 ? room : 3);
    return 3;
  }
  // Short strings keep their units on the stack.
  uint16_t small[128];
  const bool onStack = n <= std::size(small);
  Block<uint16_t> own(onStack ? nullptr : static_cast<uint16_t *>(alloc(size_t{n} * 4)));
  if (!onStack && !own) {
    setRc(l, VL_RC_NOMEM);
    return -1;
  }
  uint16_t *units = onStack ? small : own.get();
  Source<F> s{f, l->codePage, l->sort, src, n};
  uint32_t count = 0, len;
  uint16_t u;
  while (s.read(&u, &len)) units[count++] = u;
  const int32_t k = genKey(quickOf(l), dst, room, units, count, opts != 0);
  if (k < 0) setRc(l, VL_RC_NOMEM);
  return k;
}

// A locale without a sort orders by code: the comparison family, with the options
// reduced as the family table says (W values know no width folding there).
inline int byCode(VLLocale *l, Bytes, const uint8_t *a, uint32_t an, Bytes, const uint8_t *b, uint32_t bn,
                  uint32_t o) {
  return VLStrcmp(l, cb(a), static_cast<int32_t>(an), cb(b), static_cast<int32_t>(bn), o);
}
inline int byCode(VLLocale *l, Shifted fa, const uint8_t *a, uint32_t an, Shifted fb, const uint8_t *b,
                  uint32_t bn, uint32_t o) {
  return VLStrcmpEx(l, cb(a), fa.state, static_cast<int32_t>(an), cb(b), fb.state, static_cast<int32_t>(bn), o);
}
inline int byCode(VLLocale *l, WForm, const VLWChar *a, uint32_t an, WForm, const VLWChar *b, uint32_t bn,
                  uint32_t o) {
  return VLWcscmp(l, a, static_cast<int32_t>(an), b, static_cast<int32_t>(bn), o & 0x80200040u);
}
inline int byCode(VLLocale *l, UForm, const VLUChar *a, uint32_t an, UForm, const VLUChar *b, uint32_t bn,
                  uint32_t o) {
  return VLStrcmpU(l, a, static_cast<int32_t>(an), b, static_cast<int32_t>(bn), o);
}
inline uint32_t byCodeOptions(uint32_t o) {
  return o & ((o & kIgnoreWidth) == kIgnoreWidth ? 0x80200041u : 0x80200040u);
}

// Trailing blanks leave both strings: in byte forms as truncation drops them (full-width
// ones included), in W values the page's blank and, width-blind, its full-width form, in
// UTF-16 U+0020 and U+3000.
template <class F>
void trimBlanks(VLLocale *l, F fa, const U<F> *a, uint32_t *an, F fb, const U<F> *b, uint32_t *bn, uint32_t opts) {
  if constexpr (!F::kUnits) {
    str::dropBlanks(l, fa, a, an, fb, b, bn, true);
  } else {
    uint32_t blank = 0x20, wide = 0x3000;
    if constexpr (sizeof(U<F>) == 4) {
      blank = cp::isAscii(l->codePage) ? 0x20 : 0x40;
      wide = (opts & kIgnoreWidth) == kIgnoreWidth ? VLCpMbHalfToFullW(l->codePage, blank) : blank;
    }
    for (auto [s, n] : {std::pair{a, an}, std::pair{b, bn}})
      while (*n && (s[*n - 1] == blank || s[*n - 1] == wide)) --*n;
  }
}

// Bit 0x01 drops trailing blanks and then clears 0x00200000; the W form drops them on
// 0x00200000 itself. What remains must be a collation option, else code 2 and 0.
template <class F>
int coll(VLLocale *l, F fa, const U<F> *a, int32_t alen, F fb, const U<F> *b, int32_t blen, uint32_t opts) {
  setRc(l, VL_RC_OK);
  if (!a || !b) return a ? 1 : b ? -1 : 0;
  uint32_t an = unitLen(fa, a, alen, opts), bn = unitLen(fb, b, blen, opts);
  opts &= ~VL_OPT_CHARLEN;
  if (!usesSort(l)) return byCode(l, fa, a, an, fb, b, bn, byCodeOptions(opts));
  const uint32_t trigger = F::kUnits && sizeof(U<F>) == 4 ? VL_CMP_NOBLANKS : 0x01u;
  if (opts & trigger) {
    trimBlanks(l, fa, a, &an, fb, b, &bn, opts);
    opts &= ~VL_CMP_NOBLANKS;
  }
  if (!optionsOk(opts & ~0x01u)) {
    setRc(l, VL_RC_BADARG);
    return 0;
  }
  const Quick &q = quickOf(l);
  if (!q.backward) {
    // Most pairs differ in their first characters already.
    if (an && bn) {
      const uint16_t ka = q.first(fa, a, an), kb = q.first(fb, b, bn);
      if (ka != kb && ka && kb && ka != kLookUp && kb != kLookUp) return ka < kb ? -1 : 1;
    }
    F at = fa;  // the state where both walks start
    const uint32_t k = commonStart(q, l->codePage, at, a, an, fb, b, bn);
    Primaries<F> pa{{at, l->codePage, l->sort, a + k, an - k}, q};
    Primaries<F> pb{{k ? at : fb, l->codePage, l->sort, b + k, bn - k}, q};
    const int r = comparePrimaries(pa, pb);
    if (r != 2) return r;
  }
  return compareLevels(l, fa, a, an, fb, b, bn, (opts & kIgnoreCase) == kIgnoreCase);
}

}  // namespace vl::coll

namespace vl::coll {

// Hands an element pair out through the nine optional pointers of the public lookups.
inline int handOut(const Weights &w, int n, uint16_t *p1, uint8_t *s1, uint8_t *t1, uint16_t *q1, uint16_t *p2,
                   uint8_t *s2, uint8_t *t2, uint16_t *q2, uint8_t *cls) {
  const Element none{};
  const Element &a = n >= 1 ? w.e[0] : none, &b = n >= 2 ? w.e[1] : none;
  if (p1) *p1 = a.primary;
  if (s1) *s1 = a.secondary;
  if (t1) *t1 = a.tertiary;
  if (q1) *q1 = a.fourth;
  if (p2) *p2 = b.primary;
  if (s2) *s2 = b.secondary;
  if (t2) *t2 = b.tertiary;
  if (q2) *q2 = b.fourth;
  if (cls) *cls = n ? w.cls : 0;
  return n;
}

// One step of the public walk: the caller keeps pointer, remaining, counter and pending.
template <class F>
int nextWeight(VLLocale *locale, F f, const U<F> **str, int32_t *remaining, uint32_t *counter, uint16_t *p1,
               uint8_t *s1, uint8_t *t1, uint16_t *q1, uint16_t *p2, uint8_t *s2, uint8_t *t2, uint16_t *q2,
               uint8_t *cls, uint16_t *pending, uint32_t *state = nullptr) {
  Weights w;
  VLLocale *l = use(locale);
  if (!l || !str || !*str || !remaining || *remaining < 0 || !usesSort(l))
    return handOut(w, 0, p1, s1, t1, q1, p2, s2, t2, q2, cls);
  Source<F> s{f, l->codePage, l->sort, *str, static_cast<uint32_t>(*remaining)};
  if (state) s.f.state = *state;
  if (counter) s.counter = *counter;
  if (pending) s.pending = *pending;
  uint16_t pos;
  const int n = s.next(&w, &pos);
  *str = s.p;
  *remaining = static_cast<int32_t>(s.rem);
  if (counter) *counter = s.counter;
  if (pending) *pending = static_cast<uint16_t>(s.pending);
  if (state) *state = s.f.state;
  return handOut(w, n, p1, s1, t1, q1, p2, s2, t2, q2, cls);
}

}  // namespace vl::coll
