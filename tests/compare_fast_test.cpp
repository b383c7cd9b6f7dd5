// Case-insensitive comparison takes the plain case tables unless a string holds the first
// unit of a special-casing key; both ways must order every pair as the upper-cased text.
#include <cstring>
#include <random>
#include <string>
#include <vector>

#include "genloc.h"
#include "support/hooks.h"

namespace {

int sign(int64_t v) { return (v > 0) - (v < 0); }

template <class T>
int orderOf(const std::vector<T> &a, const std::vector<T> &b) {
  for (size_t i = 0; i < std::min(a.size(), b.size()); ++i)
    if (a[i] != b[i]) return a[i] < b[i] ? -1 : 1;
  return sign(int64_t(a.size()) - int64_t(b.size()));
}

// Letters that stress the fold: keys of the special tables (sharp s, n preceded by
// apostrophe, ligatures, dotted and dotless i), their upper-case forms, plain text and
// half-width katakana (one byte beside double-byte characters).
std::vector<VLUChar> alphabet() {
  std::vector<VLUChar> a;
  for (VLUChar u = 'A'; u <= 'Z'; ++u) a.push_back(u);
  for (VLUChar u = 'a'; u <= 'z'; ++u) a.push_back(u);
  for (VLUChar u : {0x20, 0xC4, 0xE4, 0xC9, 0xE9, 0xDF, 0x149, 0x130, 0x131, 0x15E, 0x15F, 0xFB00, 0xFB01, 0xFB03,
                    0x390, 0x3B1, 0x391, 0x1E9E, 0x307, 0xFF21, 0xFF41, 0x3042, 0x4E00, 0x30A2, 0xFF71, 0xFF9E})
    a.push_back(u);
  return a;
}

class CompareFast : public gents::GenLocales {
 protected:
  // Random strings of the page's characters, each set beside a copy with case changed.
  template <class Body>
  void pairs(VLLocale *l, Body body) {
    std::vector<VLUChar> held;
    for (VLUChar u : alphabet()) {
      VLUChar back[4];
      unsigned char mb[8];
      const int32_t n = VLCpUnicodeToStr(l->codePage, &u, 1, 0, mb);
      if (n > 0 && VLCpStrToUnicode(l->codePage, mb, n, back) == 1 && back[0] == u) held.push_back(u);
    }
    ASSERT_GT(held.size(), 50u) << l->codePage->name;
    std::mt19937 rng(77);
    for (int i = 0; i < 1500; ++i) {
      std::vector<VLUChar> a(1 + rng() % 9);
      for (auto &c : a) c = held[rng() % held.size()];
      std::vector<VLUChar> b = a;
      for (auto &c : b)
        if (rng() % 2) {
          VLUChar up = c;
          VLMapStringU(l, &up, 1, &c, 1, VL_MAP_UPPER | VL_MAP_NOSPECIAL);
          c = up;
        }
      if (rng() % 3 == 0) b[rng() % b.size()] = held[rng() % held.size()];
      if (rng() % 4 == 0) b.push_back(held[rng() % held.size()]);
      body(a, b);
    }
  }
  std::string encode(VLLocale *l, const std::vector<VLUChar> &u) {
    std::string out(u.size() * 6 + 4, '\0');
    const int32_t n = VLCpUnicodeToStr(l->codePage, u.data(), static_cast<int32_t>(u.size()), 0,
                                       reinterpret_cast<unsigned char *>(out.data()));
    out.resize(n > 0 ? static_cast<size_t>(n) : 0);
    return out;
  }
  // The order the special mapping gives two byte strings of the page.
  std::vector<uint8_t> upperBytes(VLLocale *l, const std::string &s, int32_t len) {
    std::vector<char> out(s.size() * 8 + 8);
    // A leading Shift-Out is the string's starting state, not a byte to compare.
    const bool so = l == sh_ && !s.empty() && s[0] == '\x0E';
    const int32_t n = l == sh_ ? VLMapStringEx(l, out.data(), static_cast<int32_t>(out.size()), s.c_str() + so, so,
                                               len < 0 ? len : len - so, VL_MAP_UPPER)
                               : VLMapString(l, out.data(), static_cast<int32_t>(out.size()), s.c_str(), len,
                                             VL_MAP_UPPER);
    return std::vector<uint8_t>(out.begin(), out.begin() + std::max(n, 0));
  }
};

TEST_F(CompareFast, BytesOrderAsTheSpecialMappingInEveryPage) {
  for (VLLocale *l : {sb_, de_, tr_, mb_, sh_}) {
    int special = 0, plain = 0;
    pairs(l, [&](const std::vector<VLUChar> &a, const std::vector<VLUChar> &b) {
      const std::string ea = encode(l, a), eb = encode(l, b);
      // Whole strings, then counted lengths that end exactly after the last character.
      for (bool counted : {false, true}) {
        const int32_t n1 = counted ? static_cast<int32_t>(ea.size()) : -1;
        const int32_t n2 = counted ? static_cast<int32_t>(eb.size()) : -1;
        const int got = l == sh_ ? VLStrcmpEx(l, ea.c_str(), 0, n1, eb.c_str(), 0, n2, VL_CMP_NOCASE)
                                 : VLStrcmp(l, ea.c_str(), n1, eb.c_str(), n2, VL_CMP_NOCASE);
        const int want = orderOf(upperBytes(l, ea, n1), upperBytes(l, eb, n2));
        ASSERT_EQ(sign(got), want) << l->codePage->name << " counted " << counted << ": " << ea << " / " << eb;
      }
      const bool hasKey = [&] {
        for (const auto *s : {&a, &b})
          for (VLUChar c : *s)
            if (c == 0xDF || c == 0x149 || c >= 0xFB00 || (l == tr_ && c == 'i')) return true;
        return false;
      }();
      (hasKey ? special : plain) += 1;
    });
    EXPECT_GT(plain, 100) << l->codePage->name;
    if (l != mb_ && l != sh_) {
      EXPECT_GT(special, 100) << l->codePage->name;
    }
  }
}

TEST_F(CompareFast, WideAndUnitFormsOrderAsTheSpecialMapping) {
  for (VLLocale *l : {de_, tr_, mb_}) {
    pairs(l, [&](const std::vector<VLUChar> &a, const std::vector<VLUChar> &b) {
      auto wide = [&](const std::vector<VLUChar> &u) {
        const std::string e = encode(l, u);
        std::vector<VLWChar> w(u.size() + 1);
        const int32_t n = VLMbToWide(l, w.data(), static_cast<int32_t>(w.size()), e.data(),
                                     static_cast<int32_t>(e.size()), 0);
        w.resize(static_cast<size_t>(std::max(n, 0)));
        w.push_back(0);
        return w;
      };
      const std::vector<VLWChar> wa = wide(a), wb = wide(b);
      auto mapW = [&](const std::vector<VLWChar> &w) {
        std::vector<VLWChar> out(w.size() * 2 + 2);
        const int32_t n = VLMapStringW(l, out.data(), static_cast<int32_t>(out.size()), w.data(), -1, VL_MAP_UPPER);
        out.resize(static_cast<size_t>(std::max(n, 0)));
        return out;
      };
      auto mapU = [&](const std::vector<VLUChar> &u) {
        std::vector<VLUChar> out(u.size() * 2 + 2);
        const int32_t n = VLMapStringU(l, out.data(), static_cast<int32_t>(out.size()), u.data(),
                                       static_cast<int32_t>(u.size()), VL_MAP_UPPER);
        out.resize(static_cast<size_t>(std::max(n, 0)));
        return out;
      };
      EXPECT_EQ(sign(VLWcscmp(l, wa.data(), -1, wb.data(), -1, VL_CMP_NOCASE)), orderOf(mapW(wa), mapW(wb)))
          << l->codePage->name;
      EXPECT_EQ(sign(VLStrcmpU(l, a.data(), static_cast<int32_t>(a.size()), b.data(),
                               static_cast<int32_t>(b.size()), VL_CMP_NOCASE)),
                orderOf(mapU(a), mapU(b)))
          << l->codePage->name;
    });
  }
}

// A key just inside or just outside a counted length decides which path runs; only the
// mapped one allocates, and it frees what it took.
TEST_F(CompareFast, KeysAtTheEndOfACountedLength) {
  struct Row {
    const char *what;
    VLLocale *CompareFast::*loc;
    const char *s1, *s2;
    int32_t n1, n2;
    int want;
    bool allocates;
  } rows[] = {
      {"sharp s last inside the length equals SS", &CompareFast::de_, "stra\xDF", "STRASS", 5, 6, 0, true},
      {"sharp s just past the length is not read", &CompareFast::de_, "stra\xDF", "STRA", 4, 4, 0, false},
      {"plain letters fold without blocks", &CompareFast::de_, "Ma\xDF" "e", "MA", 2, -1, 0, false},
      {"Turkish i upper-cases to dotted I", &CompareFast::tr_, "i", "\xDD", -1, -1, 0, true},
      {"Turkish i is not plain I", &CompareFast::tr_, "i", "I", -1, -1, 1, true},
      {"Turkish dotless i is plain I", &CompareFast::tr_, "\xFD", "I", -1, -1, 0, false},
  };
  for (const Row &r : rows) {
    VLLocale *l = this->*r.loc;
    const long allocs = ts::hooks.allocs, live = ts::hooks.live;
    EXPECT_EQ(sign(VLStrcmp(l, r.s1, r.n1, r.s2, r.n2, VL_CMP_NOCASE)), r.want) << r.what;
    EXPECT_EQ(ts::hooks.allocs != allocs, r.allocates) << r.what;
    EXPECT_EQ(ts::hooks.live, live) << r.what;
  }
}

}  // namespace
