// Shared machinery of the locale handle: where the modifiable items live in a
// territory body and in the handle, and text conversion into a code page.
#pragma once
#include <cstdint>

#include "codepage/cpbody.h"
#include "frame/frame.h"
#include "store/store.h"

namespace vl::loc {

// Territory body words.
constexpr int kPunctWord = 0;   // words 0-4: decimal, group, separator 3, monetary decimal, monetary group
constexpr int kNumWord = 5;     // words 5-7: precision, local and international fraction digits
constexpr int kSignWord = 8;    // high byte positive, low byte negative sign position
constexpr int kFlagsWord = 10;  // bit 0 territory flag, bits 1-6 the six boolean items
// Text words, in the order of the handle's eight texts (grouping, currency, monetary
// grouping, positive sign, negative sign, time, short date, long date).
constexpr int kTextWord[8] = {13, 15, 14, 17, 18, 19, 20, 21};

// setMask bits.
constexpr uint32_t kMaskNum0 = 0x1;        // items 63, 69, 70: 0x1 << i
constexpr uint32_t kMaskFlag0 = 0x8;       // items 73-76, 82, 83: 0x8 << i
constexpr uint32_t kMaskSignPos = 0x200;   // items 77, 78: 0x200 << i
constexpr uint32_t kMaskPunct0 = 0x800;    // items 59, 60, 61, 66, 67: 0x800 << i
constexpr uint32_t kMaskText0 = 0x10000;   // the eight texts: 0x10000 << i

inline const uint8_t *body(const VLObjEntry *e) {
  return static_cast<const uint8_t *>(__atomic_load_n(&e->section[0], __ATOMIC_ACQUIRE));
}
inline uint16_t word(const VLObjEntry *e, int w) { return rd16(body(e) + 2 * w); }
// A text of a language or territory body (offsets were proven in range when loaded).
inline const VLUChar *text(const VLObjEntry *e, int w) {
  return reinterpret_cast<const VLUChar *>(body(e) + word(e, w));
}

size_t ulen(const VLUChar *u);

// Converts a NUL-terminated UTF-16 text into a new code-page string (shift bytes around
// double-byte runs in a shift-sensitive page). Null when memory cannot be had.
char *toCodePage(const VLCodePage *cp, const VLUChar *u);
// A new copy of a UTF-16 text; null when memory cannot be had.
VLUChar *copyU(const VLUChar *u);

// Re-derives the items whose setMask bit is clear; new texts replace the pointers without
// freeing the old ones (callers keep an image of the handle for that). 0 or 20.
uint32_t deriveModifiable(VLLocale *l);

// Releases a handle's owned blocks; false when a free failed.
bool releaseTexts(VLLocale *l);

inline uint16_t localeFlagsFor(const VLCodePage *cp) {
  uint16_t f = 0;
  if (cp::maxLen(cp) == 1) f |= VL_LF_SINGLEBYTE;
  if (cp::isShift(cp)) f |= VL_LF_SHIFT;
  return f;
}

}  // namespace vl::loc
