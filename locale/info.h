// Shared machinery of the information items: where each item is kept, reading code-page
// strings character by character, the writers of the four getter forms, and the path
// every text setter ends in. The forms differ only in how a character is written (getters)
// or how the caller's characters become code-page bytes (setters).
#pragma once
#include <cstdint>
#include <cstring>

#include "codepage/cpprim.h"
#include "locale/locale.h"

namespace vl::info {

constexpr int32_t kLastItem = VL_ITEM_LAST;
constexpr uint32_t kGetOptions = VL_OPT_DEFAULTS | VL_OPT_CHARLEN;
constexpr uint32_t kSetOptions = VL_OPT_CHARLEN;
constexpr size_t kNameMax = 32;  // bytes of a name a setter uses

// setMaskU bits: the five punctuation characters, then the eight texts.
constexpr uint16_t kMaskUPunct0 = 0x1, kMaskUText0 = 0x20;

// Position of an item among the handle's five punctuation characters, or -1.
inline int punctIndex(int32_t item) {
  switch (item) {
    case 59: return 0;
    case 60: return 1;
    case 61: return 2;
    case 66: return 3;
    case 67: return 4;
    default: return -1;
  }
}
// Position of an item among the handle's eight texts, or -1.
inline int textIndex(int32_t item) {
  switch (item) {
    case 62: return 0;
    case 64: return 1;
    case 68: return 2;
    case 71: return 3;
    case 72: return 4;
    case 79: return 5;
    case 80: return 6;
    case 81: return 7;
    default: return -1;
  }
}
// Object type named by items 1/2, 5/6, 9/10, 11/12; -1 otherwise.
inline int objectType(int32_t item) {
  switch (item) {
    case 1: case 2: return VL_OBJ_LANGUAGE;
    case 5: case 6: return VL_OBJ_TERRITORY;
    case 9: case 10: return VL_OBJ_CODEPAGE;
    case 11: case 12: return VL_OBJ_SORT;
    default: return -1;
  }
}

// The handle to work on (null: the default locale); null when there is none, or when it
// lacks an object (a record the caller built by hand), after noting 2 in it.
inline VLLocale *target(VLLocale *locale) {
  VLLocale *l = orDefault(locale);
  if (l && (!l->language || !l->territory || !l->codePage || !loc::body(l->language) || !loc::body(l->territory) ||
            !cp::body(l->codePage))) {
    setRc(l, VL_RC_BADARG);
    return nullptr;
  }
  return l;
}

// ---- Code page facts --------------------------------------------------------------------

inline bool shiftPage(const VLLocale *l) { return (l->flags & VL_LF_SHIFT) != 0; }
inline unsigned clampLen(unsigned n) { return n < 1 ? 1 : n > 4 ? 4 : n; }
// Length of the character that starts with lead (no shift state).
inline unsigned leadLen(const VLCodePage *c, uint8_t lead) {
  if (cp::isUtf8(c)) return lead < 0xC0 ? 1u : lead > 0xDF ? 3u : 2u;
  return clampLen(cp::charLen(c, lead));
}
inline unsigned wideLen(const VLCodePage *c) { return clampLen(cp::maxLen(c)); }
inline bool isShiftByte(const VLCodePage *c, uint8_t b) { return b == cp::shiftOut(c) || b == cp::shiftIn(c); }
// A byte that is a whole character by itself (a shift byte is no character).
inline bool singleByte(const VLLocale *l, uint8_t b) {
  if (shiftPage(l)) return !isShiftByte(l->codePage, b);
  return leadLen(l->codePage, b) == 1;
}
inline bool isDigitByte(const VLCodePage *c, uint8_t b) {
  return cp::isAscii(c) ? (b >= '0' && b <= '9') : (b >= 0xF0 && b <= 0xF9);
}

// The US-ASCII code page, through which names are mapped in EBCDIC-based pages; null
// when the store has none (ASCII bytes are then taken as their own code points).
const VLCodePage *asciiPage();

// One character: its code-page bytes.
struct Piece {
  uint8_t b[4];
  unsigned n;
};

// Steps through a code-page string, at most n bytes and never past a terminator. In a
// shift-sensitive page the shift bytes switch the state and are not characters.
struct Walker {
  const VLCodePage *c;
  bool shift;
  bool wide;  // state: double-byte
  const uint8_t *p;
  size_t n;
  size_t i = 0;
  Walker(const VLLocale *l, const void *s, size_t len, bool startWide = false)
      : c(l->codePage), shift(shiftPage(l)), wide(startWide && shift), p(static_cast<const uint8_t *>(s)), n(len) {}
  // The next character; false at the end, at a terminator, or at a character cut short.
  bool next(Piece *out) {
    while (shift && i < n && p[i] && isShiftByte(c, p[i])) wide = p[i++] == cp::shiftOut(c);
    if (i >= n || !p[i]) return false;
    unsigned k = shift ? (wide ? wideLen(c) : 1u) : leadLen(c, p[i]);
    if (k > n - i) return false;
    for (unsigned j = 0; j < k; ++j) {
      if (!p[i + j]) return false;
      out->b[j] = p[i + j];
    }
    out->n = k;
    i += k;
    return true;
  }
};

// ---- Where an item is kept ------------------------------------------------------------

struct Item {
  int kind;       // VL_ITEMKIND_*
  const void *p;  // text, name, or the one unit / byte of a character item
  bool single;    // a character item: exactly one unit or byte at p
};

// Locates any item but the composed one (88) and the numeric ones. utf16 asks for the
// handle's UTF-16 copies in place of its code-page values.
bool locate(const VLLocale *l, int32_t item, bool current, bool utf16, Item *out);

// Composes item 88 (ASCII) into out, which holds VL_LOCALE_STRING_SIZE bytes.
void localeString(const VLLocale *l, char *out);

// ---- Getter writers ---------------------------------------------------------------------

// Code-page bytes; with shift on, shift bytes go in as widths change and the text ends
// in the single-byte state. Counts bytes, or characters when size does.
class ByteOut {
 public:
  ByteOut(const VLCodePage *c, char *buf, int32_t size, bool shift, bool wide, bool countChars)
      : c_(c), buf_(reinterpret_cast<uint8_t *>(buf)), size_(size), shift_(shift), wide_(wide && shift),
        chars_(countChars) {}
  bool put(const Piece &p) {
    bool w = shift_ && p.n > 1;
    int64_t change = (shift_ && w != wide_) ? 1 : 0;
    if (chars_) {
      if (count_ + 2 > size_) return false;
    } else if (used_ + change + p.n + (w ? 1 : 0) + 1 > size_) {
      return false;  // keeping room for a closing shift-in and the terminator
    }
    if (change) {
      buf_[used_++] = w ? cp::shiftOut(c_) : cp::shiftIn(c_);
      wide_ = w;
    }
    for (unsigned j = 0; j < p.n; ++j) buf_[used_++] = p.b[j];
    ++count_;
    return true;
  }
  int32_t finish() {
    if (wide_ && (chars_ ? size_ >= 2 : used_ + 2 <= size_)) buf_[used_++] = cp::shiftIn(c_);
    buf_[used_++] = 0;
    return static_cast<int32_t>(chars_ ? count_ + 1 : used_);
  }
  static constexpr bool kUnits = false;

 private:
  const VLCodePage *c_;
  uint8_t *buf_;
  int64_t size_;
  bool shift_, wide_, chars_;
  int64_t used_ = 0, count_ = 0;
};

// W values: one 32-bit value a character, bytes packed big-endian.
class WideOut {
 public:
  WideOut(VLWChar *buf, int32_t size) : buf_(buf), size_(size) {}
  bool put(const Piece &p) {
    if (used_ + 2 > size_) return false;
    VLWChar v = 0;
    for (unsigned j = 0; j < p.n; ++j) v = (v << 8) | p.b[j];
    buf_[used_++] = v;
    return true;
  }
  int32_t finish() {
    buf_[used_++] = 0;
    return static_cast<int32_t>(used_);
  }
  static constexpr bool kUnits = false;

 private:
  VLWChar *buf_;
  int64_t size_, used_ = 0;
};

// UTF-16 units, straight from the texts.
class UnitOut {
 public:
  UnitOut(VLUChar *buf, int32_t size) : buf_(buf), size_(size) {}
  bool put(VLUChar u) {
    if (used_ + 2 > size_) return false;
    buf_[used_++] = u;
    return true;
  }
  int32_t finish() {
    buf_[used_++] = 0;
    return static_cast<int32_t>(used_);
  }
  static constexpr bool kUnits = true;

 private:
  VLUChar *buf_;
  int64_t size_, used_ = 0;
};

// Feeds an item's characters to a byte or W writer until it is full.
template <class Out>
void emitChars(const VLLocale *l, const Item &it, Out &out) {
  const VLCodePage *c = l->codePage;
  Piece p;
  if (it.kind == VL_ITEMKIND_UTF16) {
    const auto *u = static_cast<const VLUChar *>(it.p);
    for (size_t i = 0; !(it.single && i > 0) && u[i]; ++i) {
      p.n = static_cast<unsigned>(cp::uniToMb(c, u[i], p.b));  // inline: getters run per name
      if (!p.n || p.n > 4 || !out.put(p)) return;
    }
  } else if (it.kind == VL_ITEMKIND_CP) {
    const auto *b = static_cast<const uint8_t *>(it.p);
    if (it.single) {
      p = {{b[0]}, 1};
      if (b[0]) out.put(p);
      return;
    }
    Walker w(l, b, SIZE_MAX);
    while (w.next(&p))
      if (!out.put(p)) return;
  } else {
    const auto *s = static_cast<const uint8_t *>(it.p);
    const VLCodePage *ascii = cp::isAscii(c) ? nullptr : asciiPage();
    for (size_t i = 0; s[i] && i < VL_LOCALE_STRING_SIZE; ++i) {
      if (cp::isAscii(c)) {
        p = {{s[i]}, 1};
      } else {
        VLUChar u = ascii ? cp::sbcsUni(ascii, s[i]) : s[i];
        p.n = static_cast<unsigned>(cp::uniToMb(c, u, p.b));
        if (!p.n || p.n > 4) return;
      }
      if (!out.put(p)) return;
    }
  }
}

// Feeds an item's UTF-16 units to the U writer until it is full.
inline void emitUnits(const Item &it, UnitOut &out) {
  if (it.kind == VL_ITEMKIND_UTF16) {
    const auto *u = static_cast<const VLUChar *>(it.p);
    for (size_t i = 0; !(it.single && i > 0) && u[i]; ++i)
      if (!out.put(u[i])) return;
  } else if (it.kind == VL_ITEMKIND_NAME) {
    const auto *s = static_cast<const uint8_t *>(it.p);
    for (size_t i = 0; s[i] && i < VL_LOCALE_STRING_SIZE; ++i)
      if (!out.put(s[i])) return;
  }
}

enum class Form { Plain, Ex, W, U };

template <Form F>
using OutChar = std::conditional_t<F == Form::W, VLWChar, std::conditional_t<F == Form::U, VLUChar, char>>;

// The getters: checks, locates the item, and writes it through the form's writer.
template <Form F>
int32_t getText(VLLocale *locale, int32_t item, OutChar<F> *buffer, VLShiftState state, int32_t size,
                uint32_t options) {
  VLLocale *l = target(locale);
  if (!l) return -1;
  if (options & ~kGetOptions) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  Item it{};
  char composed[VL_LOCALE_STRING_SIZE];
  if (item == VL_ITEM_LOCALE) {
    localeString(l, composed);
    it = {VL_ITEMKIND_NAME, composed, false};
  } else if (!locate(l, item, !(options & VL_OPT_DEFAULTS), F == Form::U, &it)) {
    setRc(l, VL_RC_BADITEM);
    return -1;
  }
  if (size == 0) {
    setRc(l, VL_RC_OK);
    return 0;
  }
  if (size < 0 || !buffer) {
    setRc(l, VL_RC_BADARG);
    return -1;
  }
  // A shift-sensitive page always writes its shift bytes; only Ex knows a state to start in.
  const bool shift = shiftPage(l) && (F == Form::Plain || F == Form::Ex);
  const bool wide = shift && F == Form::Ex && state == 1;
  int32_t n;
  if constexpr (F == Form::U) {
    UnitOut out(buffer, size);
    emitUnits(it, out);
    n = out.finish();
  } else if constexpr (F == Form::W) {
    WideOut out(buffer, size);
    emitChars(l, it, out);
    n = out.finish();
  } else {
    ByteOut out(l->codePage, buffer, size, shift, wide, (options & VL_OPT_CHARLEN) != 0);
    emitChars(l, it, out);
    n = out.finish();
  }
  setRc(l, VL_RC_OK);
  return n;
}

// ---- Setters ------------------------------------------------------------------------------

// Puts an object into the handle: a language or sort in place, a territory or code page
// through the all-or-nothing changes (a null sort is binary order). Returns the code.
uint32_t applyObject(VLLocale *l, int type, VLObjEntry *e);
// The code of a failed object lookup: memory is passed on, anything else is "not found".
inline uint32_t lookupRc(uint32_t rc) { return rc == VL_RC_NOMEM ? VL_RC_NOMEM : VL_RC_NOTFOUND; }

// Stores code-page bytes s[0..n) as the item (n may be 0: an empty value). length is the
// caller's, for the trace. Returns the code; on failure the handle is as it was.
uint32_t storeText(Tracer &trc, VLLocale *l, int32_t item, const uint8_t *s, size_t n, int32_t length);

// Writes characters into a block as code-page bytes, with shift bytes around double-byte
// runs in a shift-sensitive page and a closing shift-in.
class ByteSink {
 public:
  ByteSink(const VLLocale *l, size_t capacity) : c_(l->codePage), shift_(shiftPage(l)), buf_(capacity + 2) {}
  bool ok() const { return static_cast<bool>(buf_); }
  void put(const Piece &p) {
    bool w = shift_ && p.n > 1;
    if (shift_ && w != wide_) {
      buf_.get()[n_++] = w ? cp::shiftOut(c_) : cp::shiftIn(c_);
      wide_ = w;
    }
    for (unsigned j = 0; j < p.n; ++j) buf_.get()[n_++] = p.b[j];
  }
  const uint8_t *close() {
    if (wide_) buf_.get()[n_++] = cp::shiftIn(c_);
    wide_ = false;
    return buf_.get();
  }
  size_t size() const { return n_; }

 private:
  const VLCodePage *c_;
  bool shift_;
  bool wide_ = false;
  Block<uint8_t> buf_;
  size_t n_ = 0;
};

template <class In>
size_t inputLength(const In *data, int32_t length) {
  if (length >= 0) return static_cast<size_t>(length);
  size_t n = 0;
  while (data[n]) ++n;
  return n;
}

template <Form F>
using InChar = std::conditional_t<F == Form::Ex, char, OutChar<F>>;

// The setters: the caller's text becomes code-page bytes (in a shift-sensitive page
// re-written so that it starts and ends in the single-byte state and holds whole
// characters), then one common path stores it.
template <Form F>
int setText(Tracer &trc, VLLocale *locale, int32_t item, const InChar<F> *data, VLShiftState state, int32_t length,
            uint32_t options) {
  VLLocale *l = target(locale);
  if (!l) return 0;
  if ((options & ~kSetOptions) || (!data && length != 0)) {
    setRc(l, VL_RC_BADARG);
    return 0;
  }
  size_t n = length == 0 ? 0 : inputLength(data, length);
  if (n == 0) {
    setRc(l, VL_RC_OK);  // nothing to set
    return 1;
  }
  uint32_t rc;
  if constexpr (F == Form::Plain || F == Form::Ex) {
    const auto *s = reinterpret_cast<const uint8_t *>(data);
    const bool wide = F == Form::Ex && state == 1;
    Piece p;
    if (options & VL_OPT_CHARLEN) {
      // Characters to bytes, never past the terminator.
      Walker w(l, s, SIZE_MAX, wide);
      for (size_t k = 0; k < n && w.next(&p); ++k) {
      }
      n = w.i;
    }
    if (!shiftPage(l)) {
      rc = storeText(trc, l, item, s, n, length);
    } else {
      ByteSink sink(l, n);
      if (!sink.ok()) {
        setRc(l, VL_RC_NOMEM);
        return 0;
      }
      Walker w(l, s, n, wide);
      while (w.next(&p)) sink.put(p);
      const uint8_t *b = sink.close();
      rc = storeText(trc, l, item, b, sink.size(), length);
    }
  } else {
    ByteSink sink(l, n * 5);
    if (!sink.ok()) {
      setRc(l, VL_RC_NOMEM);
      return 0;
    }
    Piece p;
    for (size_t i = 0; i < n && data[i]; ++i) {
      if constexpr (F == Form::W)
        p.n = static_cast<unsigned>(VLWToMb(p.b, data[i]));
      else
        p.n = static_cast<unsigned>(VLCpUnicodeToChar(l->codePage, data[i], p.b));
      if (!p.n || p.n > 4) break;
      sink.put(p);
    }
    const uint8_t *b = sink.close();
    rc = storeText(trc, l, item, b, sink.size(), length);
  }
  setRc(l, rc);
  return rc == VL_RC_OK ? 1 : 0;
}

}  // namespace vl::info
