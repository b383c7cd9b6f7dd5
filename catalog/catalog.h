// Message catalogs: the file layout, the checks made where a catalog enters, and the
// bounded search shared by sets and messages.
#pragma once
#include <cstring>

#include "codepage/step.h"

namespace vl::cat {

constexpr uint32_t kOneMask = 0x80000061u;
constexpr uint32_t kHeader = VL_CAT_HEADER, kSetRec = VL_CAT_SETRECORD, kEntry = VL_CAT_INDEXENTRY;
constexpr uint32_t kNameAt = 20;

inline VLLocale *reportTo(const VLCatalog *c) { return orDefault(c ? c->locale : nullptr); }
inline uint32_t fail(VLLocale *l, uint32_t rc) { return setRc(l, rc); }

// Does [offset, offset + length) lie within a file of `size` bytes?
inline bool within(uint64_t offset, uint64_t length, uint32_t size) { return offset + length <= size; }

// A header block that this host can read: magic, version, byte order, a set count the
// file could hold, a first set record inside the file and a terminated locale name.
inline bool headerOk(const uint8_t *h, uint32_t size) {
  const uint32_t sets = rd32(h + 12), first = rd32(h + 16);
  return size >= kHeader && rd32(h) == VL_CAT_MAGIC && rd32(h + 4) == VL_CAT_VERSION &&
         rd32(h + 8) == static_cast<uint32_t>(VLMcGetByteOrder()) && sets >= 1 && sets <= size / kSetRec &&
         first >= kHeader && within(first, kSetRec, size) &&
         std::memchr(h + kNameAt, 0, VL_CAT_LOCALENAME) != nullptr;
}

// The header's locale, into whose code page nothing is converted: it says what the
// texts are in.
// Fails with 71 for a name no locale answers to, 20 when memory ran out.
inline uint32_t headerLocale(const uint8_t *h, VLLocale **out) {
  uint32_t rc = 0;
  *out = VLGetLocale(reinterpret_cast<const char *>(h + kNameAt), 0, &rc);
  return *out ? VL_RC_OK : rc == VL_RC_NOMEM ? VL_RC_NOMEM : VL_RC_CAT_INVALID;
}

// Reads n bytes at a file offset, all of them or nothing.
inline bool readAt(VLCatalog *c, uint64_t at, void *buf, uint32_t n) {
  uint32_t rc = 0;
  return at <= INT32_MAX && VLSeekFile(c->file, static_cast<int32_t>(at), VL_SEEK_SET) == 0 &&
         VLReadFile(c->file, buf, n, &rc) == static_cast<int32_t>(n) && rc == 0;
}

// A set record from its 28 file bytes.
inline void readSet(const uint8_t *p, VLMcSet *s) {
  s->number = rd32(p);
  s->next = rd32(p + 4);
  s->count = rd32(p + 8);
  s->indexOffset = rd32(p + 12);
  s->textOffset = rd32(p + 16);
  s->textSize = rd32(p + 20);
  s->reserved = rd32(p + 24);
  s->index = nullptr;
  s->text = nullptr;
}

// Search over n entries with ascending numbers. Numbers are usually dense from 1, so the
// first probe is where t would be then; the target can lie no further than t - e entries
// past an entry numbered e.
template <class E>
E *bounded(E *a, uint32_t n, uint32_t t) {
  if (!a || !n || t < 1) return nullptr;
  uint32_t lo = 0, hi, probe;
  if (t - 1 < n) {
    probe = t - 1;
    hi = t;
  } else {
    hi = n;
    probe = n / 2;
  }
  for (;;) {
    const uint32_t e = a[probe].number;
    if (e == t) return a + probe;
    bool up = e < t;
    if (up) {
      lo = probe + 1;
      uint64_t reach = uint64_t{probe} + (t - e) + 1;
      if (reach < hi) hi = static_cast<uint32_t>(reach);
    } else {
      hi = probe;
    }
    if (lo >= hi) return nullptr;
    uint32_t d = hi - lo, step = d == 1 ? 1 : d / 2;
    probe = up ? probe + step : probe - step;
  }
}

// Frees everything a catalog record holds except its file.
inline void dispose(VLCatalog *c) {
  if (c->sets) {
    for (uint32_t i = 0; i < c->setCount; ++i) {
      release(c->sets[i].index);
      release(c->sets[i].text);
    }
    release(c->sets);
  }
  VLUnloadFile(c->image);
  if (c->catLocale) VLReleaseLocale(c->catLocale);
  release(c);
}

// The default text cut to fit length bytes with its 0. In a shift-sensitive page the cut
// is truncation's, which closes a double-byte run it ends in; that works on a scratch copy
// (false when it cannot be had).
inline bool copyDefault(VLLocale *l, char *buffer, int32_t length, const char *text) {
  const size_t n = std::strlen(text);
  if (n < static_cast<size_t>(length)) {
    std::memcpy(buffer, text, n + 1);
    return true;
  }
  if (!step::isShifted(l)) {
    const int32_t k = VLStrcpy(l, buffer, length - 1, text, static_cast<int32_t>(n), 0);
    buffer[k > 0 ? k : 0] = 0;
    return true;
  }
  buffer[0] = 0;
  Block<char> scratch(static_cast<size_t>(length) + 1);
  if (!scratch) return false;
  std::memcpy(scratch.get(), text, static_cast<size_t>(length));
  scratch.get()[length] = 0;
  const int32_t k = VLTruncateStringEx(l, scratch.get(), 0, length, 0);
  if (k > 0) std::memcpy(buffer, scratch.get(), static_cast<size_t>(k));
  return true;
}

// ---- The W and UTF-16 members: through the caller's code page ---------------------------

// A unit takes at most four bytes in any code page, plus a shift byte.
constexpr size_t kBytesPerUnit = 5;

inline int32_t toBytes(VLLocale *l, const VLWChar *in, uint32_t n, char *out, uint32_t size) {
  int32_t k = VLWideToMbEx(l, out, 0, static_cast<int32_t>(size - 1), in, static_cast<int32_t>(n), 0);
  out[k > 0 ? k : 0] = 0;
  return k;
}
inline int32_t toBytes(VLLocale *l, const VLUChar *in, uint32_t n, char *out, uint32_t size) {
  return VLUnicodeToStringEx(l, out, 0, static_cast<int32_t>(size), in, static_cast<int32_t>(n), VL_OPT_NULLTERM);
}
inline void fromBytes(VLLocale *l, const char *in, VLWChar *out, int32_t count) {
  int32_t n = VLMbToWideEx(l, out, count - 1, in, 0, static_cast<int32_t>(std::strlen(in)), 0);
  out[n > 0 ? n : 0] = 0;
}
inline void fromBytes(VLLocale *l, const char *in, VLUChar *out, int32_t count) {
  VLStringToUnicodeEx(out, count, l, in, 0, -1, VL_OPT_NULLTERM);
}

// A W or UTF-16 string in the locale's code page; null stays null.
template <class T>
Block<char> bytesOf(VLLocale *l, const T *s, bool *failed) {
  if (!s) return Block<char>();
  const uint32_t n = step::length(s);
  const size_t size = size_t{n} * kBytesPerUnit + 2;
  Block<char> out(size);
  if (!out) return *failed = true, Block<char>();
  toBytes(l, s, n, out.get(), static_cast<uint32_t>(size));
  return out;
}

template <class T>
VLCatalog *openWide(VLLocale *locale, const T *pathTemplate, const T *name, uint32_t options) {
  VLLocale *l = step::use(locale);
  if (!l) return VLOpenCatalog(locale, nullptr, nullptr, options);
  bool failed = false;
  Block<char> t = bytesOf(l, pathTemplate, &failed), n = bytesOf(l, name, &failed);
  if (failed) {
    setRc(l, VL_RC_NOMEM);
    return nullptr;
  }
  return VLOpenCatalog(locale, t.get(), n.get(), options);
}

// The default goes into the caller's code page, the message comes back from it.
template <class T>
uint32_t getWide(VLCatalog *c, uint32_t set, uint32_t message, T *buffer, int32_t length, const T *defaultText,
                 uint32_t unused) {
  VLLocale *l = reportTo(c);
  if (!c || !buffer) return fail(l, VL_RC_BADARG);
  if (length <= 0) {
    buffer[0] = 0;
    return fail(l, VL_RC_OK);
  }
  const size_t scratchSize = size_t(length) * kBytesPerUnit + 2;
  Block<char> scratch(scratchSize);
  bool failed = !scratch;
  Block<char> def = bytesOf(l, defaultText, &failed);
  if (failed) return fail(l, VL_RC_NOMEM);
  uint32_t rc = VLGetMessage(c, set, message, scratch.get(), static_cast<int32_t>(scratchSize), def.get(), unused);
  fromBytes(l, scratch.get(), buffer, length);
  return fail(l, rc);
}

}  // namespace vl::cat
