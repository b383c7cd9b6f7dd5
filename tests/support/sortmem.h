// Small sort objects written by hand for tests, laid out by the generator's own writer and
// put through the library's load check as the loader does.
#pragma once
#include <vector>

#include "sortbuild.h"
#include "veltrin.h"

namespace sortmem {

// Block 0x00 through the weight table (digits primaries 0x100 + d, letters a-z 0x120 + 2i, capitals the same
// primary with tertiary 2, '-' fourth-level only, U+00E6 expanding to a+e, U+00E5 weights
// with a backward secondary), block 0x03 ignorable, block 0x4E arithmetic primaries,
// block 0x20 arithmetic fourth level; "ch" combines after 'h'.
mkdefs::SortBody sampleBody();

struct Loaded {
  VLObjEntry entry{};
  mkdefs::Bytes data;
  uint32_t rc = 0;
  explicit Loaded(const mkdefs::Bytes &body);
  explicit Loaded(const mkdefs::SortBody &body);
  Loaded(const Loaded &) = delete;
  const VLObjEntry *sort() const { return &entry; }
};

}  // namespace sortmem
