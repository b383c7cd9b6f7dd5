// The directive tables: for each pattern byte, VL_TM_BASE + its directive code or -1.
// One table per letter layout: ASCII, EBCDIC, and the Katakana EBCDIC of code page 930,
// which moves the small letters.
#include "format/timefam.h"

namespace {

using namespace vl::tf;

struct Directive {
  char letter;
  int code;
};
constexpr Directive kDirectives[] = {
    {'%', kPercent},  {'#', kModifier}, {'a', kAbDay},  {'A', kDayName}, {'b', kAbMon}, {'B', kMonName},
    {'c', kDateTime}, {'d', kMday},     {'H', kHour},   {'I', kHour12},  {'j', kYday},  {'m', kMonth},
    {'M', kMinute},   {'p', kAmPm},     {'S', kSecond}, {'U', kWeekSun}, {'w', kWday},  {'W', kWeekMon},
    {'x', kDate},     {'X', kTime},     {'y', kYear2},  {'Y', kYear4},   {'z', kZone},  {'Z', kZoneName},
};

enum class Layout { Ascii, Ebcdic, Ebcdic930 };

// The byte of an ASCII letter or sign in a layout.
constexpr int byteOf(char c, Layout lay) {
  if (lay == Layout::Ascii) return static_cast<unsigned char>(c);
  if (c == '%') return 0x6C;
  if (c == '#') return 0x7B;
  if (c >= 'A' && c <= 'I') return 0xC1 + (c - 'A');
  if (c >= 'J' && c <= 'R') return 0xD1 + (c - 'J');
  if (c >= 'S' && c <= 'Z') return 0xE2 + (c - 'S');
  if (lay == Layout::Ebcdic) {
    if (c >= 'a' && c <= 'i') return 0x81 + (c - 'a');
    if (c >= 'j' && c <= 'r') return 0x91 + (c - 'j');
    return 0xA2 + (c - 's');
  }
  if (c >= 'a' && c <= 'h') return 0x62 + (c - 'a');
  if (c >= 'i' && c <= 'p') return 0x71 + (c - 'i');
  if (c == 'q') return 0x8B;
  if (c == 'r') return 0x9B;
  if (c == 's') return 0xAB;
  return 0xB3 + (c - 't');
}

constexpr int32_t entry(int b, Layout lay) {
  for (const Directive &d : kDirectives)
    if (byteOf(d.letter, lay) == b) return VL_TM_BASE + d.code;
  return VL_TM_NONE;
}

}  // namespace

#define VL_E16(L, b)                                                                                                \
  entry((b) + 0, L), entry((b) + 1, L), entry((b) + 2, L), entry((b) + 3, L), entry((b) + 4, L), entry((b) + 5, L), \
      entry((b) + 6, L), entry((b) + 7, L), entry((b) + 8, L), entry((b) + 9, L), entry((b) + 10, L),               \
      entry((b) + 11, L), entry((b) + 12, L), entry((b) + 13, L), entry((b) + 14, L), entry((b) + 15, L)
#define VL_E256(L)                                                                                                    \
  VL_E16(L, 0), VL_E16(L, 16), VL_E16(L, 32), VL_E16(L, 48), VL_E16(L, 64), VL_E16(L, 80), VL_E16(L, 96),             \
      VL_E16(L, 112), VL_E16(L, 128), VL_E16(L, 144), VL_E16(L, 160), VL_E16(L, 176), VL_E16(L, 192), VL_E16(L, 208), \
      VL_E16(L, 224), VL_E16(L, 240)

extern "C" {
const int32_t VLAsciiTMChar[256] = {VL_E256(Layout::Ascii)};
const int32_t VLEbcdicTMChar[256] = {VL_E256(Layout::Ebcdic)};
const int32_t VLEbcdic930TMChar[256] = {VL_E256(Layout::Ebcdic930)};
}
