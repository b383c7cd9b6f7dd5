// Layout of a loaded code page body (native byte order once loaded) and the small
// readers every primitive shares.
#pragma once
#include <cstdint>

#include "frame/frame.h"

namespace vl::cp {

constexpr uint32_t kSubst = 0, kLf = 1, kCr = 2, kLs = 3, kPs = 4, kMaxLen = 5, kPairCount = 6;
constexpr uint32_t kShiftOut = 8, kShiftIn = 9, kLenTable = 10, kSbcsUni = 778, kSbcsType = 1292;
// Each byte's upper-case form (the fold of case-insensitive comparison), then its lower-case form.
constexpr uint32_t kSbcsUpper = 266, kSbcsLower = 522;
constexpr uint32_t kIndex = 2316, kFlags = 4364, kFullOff = 4366, kPairOff = 4368;
constexpr uint32_t kTypeTrieOff = 4370, kTypeRecOff = 4372, kValueOff = 4374, kHeader = 4376;
// First-generation bodies: the same header without the shift bytes, four offsets.
constexpr uint32_t kV1Header = 4372;

// kFlagOneByteTypes: type records 1 to 256 are those of the one-byte characters, by byte.
constexpr uint16_t kFlagAscii = 0x0001, kFlagShift = 0x0002, kFlagOneByteTypes = 0x0004;
constexpr uint32_t kNodeSize = 6, kTypeNodeSize = 4, kRecordSize = 8, kIndexSize = 8;

inline const uint8_t *body(const VLCodePage *c) { return static_cast<const uint8_t *>(c->section[0]); }
inline const uint8_t *trie(const VLCodePage *c) { return static_cast<const uint8_t *>(c->section[1]); }
inline const uint8_t *lowTable(const VLCodePage *c) { return static_cast<const uint8_t *>(c->section[2]); }
inline const uint8_t *highTable(const VLCodePage *c) { return static_cast<const uint8_t *>(c->section[3]); }

inline bool isUtf8(const VLCodePage *c) { return c->id == VL_CP_UTF8; }
inline uint8_t maxLen(const VLCodePage *c) { return body(c)[kMaxLen]; }
inline uint8_t charLen(const VLCodePage *c, uint8_t lead) { return body(c)[kLenTable + lead]; }
inline uint8_t subst(const VLCodePage *c) { return body(c)[kSubst]; }
inline uint8_t shiftOut(const VLCodePage *c) { return body(c)[kShiftOut]; }
inline uint8_t shiftIn(const VLCodePage *c) { return body(c)[kShiftIn]; }
inline uint16_t flags(const VLCodePage *c) { return rd16(body(c) + kFlags); }
inline bool isShift(const VLCodePage *c) { return (flags(c) & kFlagShift) != 0; }
inline bool isAscii(const VLCodePage *c) { return (flags(c) & kFlagAscii) != 0; }
inline uint16_t sbcsUni(const VLCodePage *c, uint8_t b) { return rd16(body(c) + kSbcsUni + 2u * b); }
inline uint32_t sbcsType(const VLCodePage *c, uint8_t b) { return rd32(body(c) + kSbcsType + 4u * b); }
inline uint8_t sbcsUpper(const VLCodePage *c, uint8_t b) { return body(c)[kSbcsUpper + b]; }
inline uint8_t sbcsLower(const VLCodePage *c, uint8_t b) { return body(c)[kSbcsLower + b]; }
inline uint16_t off(const VLCodePage *c, uint32_t at) { return rd16(body(c) + at); }

}  // namespace vl::cp
