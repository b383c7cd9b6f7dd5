#include "sortmem.h"

#include "store/store.h"

namespace sortmem {

mkdefs::SortBody sampleBody() {
  mkdefs::SortBody b;
  b.defSec = 1;
  b.defTer = 1;
  const uint16_t fwd = 0xF << 10;
  b.weights.resize(256);
  for (int i = 0; i < 26; ++i) {
    b.weights['a' + i] = {static_cast<uint16_t>(0x120 + 2 * i), 1, 1, fwd};
    b.weights['A' + i] = {static_cast<uint16_t>(0x120 + 2 * i), 1, 2, fwd};
  }
  for (int d = 0; d < 10; ++d) b.weights['0' + d] = {static_cast<uint16_t>(0x100 + d), 1, 1, fwd};
  b.weights['-'] = {0x30, 0, 0, 0x8000 | fwd};
  b.weights[0xE6] = {0, 0, 0, 0x4000 | fwd};
  b.weights[0xE5] = {0x120, 5, 1, 0xB << 10};  // a with a backward secondary
  b.expansions.push_back({0xE6, 0x120, 1, 3, 0x128, 1, 3});
  b.weights[0xE7] = {0, 0, 0, 0x4000 | fwd};   // expands, but has no expansion entry
  b.blocks[0x03].flags = 0x01;
  b.blocks[0x4E] = {0x02, 0xF, 0x2000};
  b.blocks[0x20] = {0x04, 0xF, 0x1000};
  b.combinations.push_back({'c', 'h', 0x12F /* between h and i */, 1, 1, fwd});
  return b;
}

Loaded::Loaded(const mkdefs::Bytes &body) : data(body) {
  entry.id = 1;
  entry.type = VL_OBJ_SORT;
  entry.section[0] = data.empty() ? nullptr : data.data();
  entry.sectionSize[0] = static_cast<uint16_t>(data.size());
  rc = vl::store::checkObject(&entry);
}

static mkdefs::Bytes laidOut(const mkdefs::SortBody &b) {
  mkdefs::Bytes out;
  std::string err;
  b.bytes(&out, &err);
  return out;
}

Loaded::Loaded(const mkdefs::SortBody &body) : Loaded(laidOut(body)) {}

}  // namespace sortmem
