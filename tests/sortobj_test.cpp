// Sort objects at load: every damaged offset, count or index is refused with 2000.
#include <gtest/gtest.h>

#include <functional>

#include "string/sortbody.h"
#include "support/sortmem.h"

namespace {

namespace so = vl::sort;
using mkdefs::Bytes;

void at16(Bytes &b, size_t off, uint16_t v) {
  b[off] = static_cast<uint8_t>(v >> 8);
  b[off + 1] = static_cast<uint8_t>(v);
}
uint16_t get16(const Bytes &b, size_t off) { return static_cast<uint16_t>(b[off] << 8 | b[off + 1]); }

Bytes sample() {
  Bytes b;
  std::string err;
  EXPECT_TRUE(sortmem::sampleBody().bytes(&b, &err)) << err;
  return b;
}

TEST(SortObject, HealthyBodyLoadsInNativeOrder) {
  sortmem::Loaded s(sortmem::sampleBody());
  ASSERT_EQ(s.rc, 0u);
  so::Weights w;
  EXPECT_EQ(so::weightsOf(s.sort(), 'b', &w), 1);
  EXPECT_EQ(w.e[0].primary, 0x122);
  EXPECT_EQ(so::weightsOf(s.sort(), 0xE6, &w), 2);
  EXPECT_EQ(w.e[1].primary, 0x128);
  EXPECT_EQ(so::combinationOf(s.sort(), 'c', 'h', &w), 1);
  EXPECT_EQ(w.e[0].primary, 0x12F);
}

TEST(SortObject, DamagedBodiesAreRefused) {
  const size_t blocks = so::kBlocks;
  struct Case {
    const char *what;
    std::function<void(Bytes &)> damage;
  } cases[] = {
      {"a body shorter than its header", [](Bytes &b) { b.resize(so::kHeader - 1); }},
      {"an empty body", [](Bytes &b) { b.clear(); }},
      {"a weight table offset past the end", [](Bytes &b) { at16(b, so::kWeightOff, 0xFFF0); }},
      {"a weight table offset inside the header", [](Bytes &b) { at16(b, so::kWeightOff, 100); }},
      {"a block indexing past the weight table",
       [&](Bytes &b) { at16(b, blocks + 4 * 0x05 + 2, 1); }},
      {"a weight table cut short by the expansion table",
       [](Bytes &b) { at16(b, so::kExpOff, static_cast<uint16_t>(get16(b, so::kWeightOff) + 6 * 200)); }},
      {"more expansions than the table holds", [](Bytes &b) { at16(b, so::kExpCount, 2); }},
      {"expansions counted without a table", [](Bytes &b) { at16(b, so::kExpOff, 0); }},
      {"more combinations than the table holds", [](Bytes &b) { at16(b, so::kCombCount, 7); }},
      {"a combination table offset past the end", [](Bytes &b) { at16(b, so::kCombOff, 0xFFFF); }},
      {"an arithmetic primary block that wraps",
       [&](Bytes &b) { b[blocks + 4 * 0x4E] = 0x02, at16(b, blocks + 4 * 0x4E + 2, 0xFF01); }},
      {"an arithmetic fourth-level block that wraps",
       [&](Bytes &b) { b[blocks + 4 * 0x20] = 0x04, at16(b, blocks + 4 * 0x20 + 2, 0xFFFF); }},
      {"no weight table for blocks that need one", [](Bytes &b) { at16(b, so::kWeightOff, 0); }},
      {"combinations out of order", [](Bytes &b) {
         const size_t c = get16(b, so::kCombOff);
         at16(b, so::kCombCount, 2);
         b.insert(b.begin() + static_cast<long>(c + 10), {0, 'a', 0, 'a', 1, 0, 1, 1, 0, 0});
       }},
  };
  for (const auto &c : cases) {
    Bytes b = sample();
    c.damage(b);
    sortmem::Loaded s(b);
    EXPECT_EQ(s.rc, VL_RC_BADMAGIC) << "accepted " << c.what;
  }
  // An ignorable block may carry any base: it is never used.
  Bytes b = sample();
  b[blocks + 4 * 0x30] = 0x01;
  at16(b, blocks + 4 * 0x30 + 2, 0xFFFF);
  EXPECT_EQ(sortmem::Loaded(b).rc, 0u);
}

}  // namespace
