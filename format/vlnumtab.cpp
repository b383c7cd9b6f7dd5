// Digit values of bytes in ASCII, EBCDIC and the EBCDIC layout of code page 930.
#include <array>

#include "format/numfam.h"

namespace {

using Table = std::array<int32_t, 256>;

constexpr Table fill(const uint8_t (&letters)[26], const uint8_t (&lower)[26], uint8_t zero) {
  Table t{};
  for (auto &v : t) v = -1;
  for (int i = 0; i < 10; ++i) t[zero + i] = i;
  for (int i = 0; i < 26; ++i) t[letters[i]] = t[lower[i]] = 10 + i;
  return t;
}

constexpr uint8_t kAsciiUpper[26] = {'A', 'B', 'C', 'D', 'E', 'F', 'G', 'H', 'I', 'J', 'K', 'L', 'M',
                                     'N', 'O', 'P', 'Q', 'R', 'S', 'T', 'U', 'V', 'W', 'X', 'Y', 'Z'};
constexpr uint8_t kAsciiLower[26] = {'a', 'b', 'c', 'd', 'e', 'f', 'g', 'h', 'i', 'j', 'k', 'l', 'm',
                                     'n', 'o', 'p', 'q', 'r', 's', 't', 'u', 'v', 'w', 'x', 'y', 'z'};
constexpr uint8_t kEbcdicUpper[26] = {0xC1, 0xC2, 0xC3, 0xC4, 0xC5, 0xC6, 0xC7, 0xC8, 0xC9, 0xD1, 0xD2, 0xD3, 0xD4,
                                      0xD5, 0xD6, 0xD7, 0xD8, 0xD9, 0xE2, 0xE3, 0xE4, 0xE5, 0xE6, 0xE7, 0xE8, 0xE9};
constexpr uint8_t kEbcdicLower[26] = {0x81, 0x82, 0x83, 0x84, 0x85, 0x86, 0x87, 0x88, 0x89, 0x91, 0x92, 0x93, 0x94,
                                      0x95, 0x96, 0x97, 0x98, 0x99, 0xA2, 0xA3, 0xA4, 0xA5, 0xA6, 0xA7, 0xA8, 0xA9};
// Code page 930 gives the lower-case positions to katakana and moves the letters.
constexpr uint8_t k930Lower[26] = {0x62, 0x63, 0x64, 0x65, 0x66, 0x67, 0x68, 0x69, 0x71, 0x72, 0x73, 0x74, 0x75,
                                   0x76, 0x77, 0x78, 0x8B, 0x9B, 0xAB, 0xB3, 0xB4, 0xB5, 0xB6, 0xB7, 0xB8, 0xB9};

constexpr Table kAscii = fill(kAsciiUpper, kAsciiLower, '0');
constexpr Table kEbcdic = fill(kEbcdicUpper, kEbcdicLower, 0xF0);
constexpr Table k930 = fill(kEbcdicUpper, k930Lower, 0xF0);

}  // namespace

#define VL_TABLE(name, from) \
  const int32_t name[256] = {VL_ROW(from, 0), VL_ROW(from, 64), VL_ROW(from, 128), VL_ROW(from, 192)}
#define VL_ROW(t, b) VL_R16(t, b), VL_R16(t, b + 16), VL_R16(t, b + 32), VL_R16(t, b + 48)
#define VL_R16(t, b)                                                                                         \
  t[b], t[b + 1], t[b + 2], t[b + 3], t[b + 4], t[b + 5], t[b + 6], t[b + 7], t[b + 8], t[b + 9], t[b + 10], \
      t[b + 11], t[b + 12], t[b + 13], t[b + 14], t[b + 15]

VL_TABLE(VLAsciiToNum, kAscii);
VL_TABLE(VLEbcdicToNum, kEbcdic);
VL_TABLE(VLEbcdic930ToNum, k930);
