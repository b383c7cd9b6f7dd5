// Four small code pages held in memory, each behind its own locale handle: single-byte,
// double-byte (leads 0x81-0x9F), Shift-Out/Shift-In (0x0E/0x0F, line feed 0x25) and UTF-8.
// Double-byte characters all classify as ideographs.
#pragma once
#include <string>
#include <utility>
#include <vector>

#include "support/cpmem.h"
#include "veltrin.h"

namespace stepts {

enum Kind { kSingle, kDouble, kShift, kUtf8 };

constexpr uint32_t kTypeA = 0x10000A13;  // the letter A
constexpr uint32_t kIdeo = 0x40000801;

// Line-end bytes and single-byte type words are patched into the body as the files
// hold it (big-endian).
struct Extra {
  uint8_t lf = 0x0A, cr = 0x0D, ls = 0x1E, ps = 0x1F;
  std::vector<std::pair<uint8_t, uint32_t>> types = {{'A', kTypeA}};
};

inline std::vector<cpmem::Bytes> sectionsOf(const cpmem::Page &p, const Extra &x) {
  std::vector<cpmem::Bytes> s = p.sections();
  cpmem::Bytes &b = s[0];
  b[1] = x.lf;
  b[2] = x.cr;
  b[3] = x.ls;
  b[4] = x.ps;
  for (auto [byte, word] : x.types)
    for (int i = 0; i < 4; ++i) b[1292 + 4 * byte + i] = static_cast<uint8_t>(word >> (24 - 8 * i));
  return s;
}

inline Extra extraOf(Kind k) {
  Extra x;
  if (k == kShift) {
    x.lf = x.ls = x.ps = 0x25;
    x.types.push_back({0xC1, kTypeA});
  }
  return x;
}

inline cpmem::Page pageOf(Kind k) {
  cpmem::Page p;
  auto tries = [&p] {
    p.typeNodes = {{0, 0x00, 1}, {1, 0xFF, 0}};
    p.records.assign(256, VLCtypeRecord{kIdeo, 0});
    p.nodes = {{0, 0x00, 0, 255, 1}, {1, 0xFF, 0, 255, 0}};
    p.values.assign(256, 0x4E00);
  };
  switch (k) {
    case kSingle:
      break;
    case kDouble:
      p.maxLen = 2;
      for (int b = 0x81; b <= 0x9F; ++b) p.len[b] = 2;
      tries();
      break;
    case kShift:
      p.maxLen = 2;
      p.flags = 0x0002;
      p.so = 0x0E;
      p.si = 0x0F;
      tries();
      break;
    case kUtf8:
      p.maxLen = 3;
      for (int b = 0xC0; b <= 0xDF; ++b) p.len[b] = 2;
      for (int b = 0xE0; b <= 0xEF; ++b) p.len[b] = 3;
      break;
  }
  return p;
}

struct PageLocale {
  cpmem::Loaded page;
  VLLocale loc{};
  explicit PageLocale(Kind k)
      : page(sectionsOf(pageOf(k), extraOf(k)), k == kUtf8 ? VL_CP_UTF8 : k == kShift ? 930 : k == kDouble ? 932 : 819) {
    loc.codePage = &page.entry;
    loc.flags = static_cast<uint16_t>((k == kSingle ? VL_LF_SINGLEBYTE : 0) | (k == kShift ? VL_LF_SHIFT : 0));
  }
};

inline VLLocale *locale(Kind k) {
  static PageLocale single(kSingle), dbl(kDouble), shift(kShift), utf8(kUtf8);
  PageLocale *all[] = {&single, &dbl, &shift, &utf8};
  return all[k]->page.rc == 0 ? &all[k]->loc : nullptr;  // a page the loader refuses fails every case
}

// Bytes of a string literal that may hold 0 bytes.
template <size_t N>
std::string B(const char (&s)[N]) {
  return std::string(s, N - 1);
}

}  // namespace stepts
