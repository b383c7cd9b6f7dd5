// Shared by the fuzz harnesses: a scratch definitions directory whose files are the
// generated ones except the one a harness replaces, and a workout of a locale that
// touches every family built on it.
#pragma once
#include <cstddef>
#include <cstdint>
#include <string>

#include "veltrin.h"

namespace fuzz {

// The generated definitions directory (compiled in by the build).
const char *realDefs();

// A private copy (links) of the generated directory; replace() writes one file anew.
class Scratch {
 public:
  Scratch();
  ~Scratch();
  Scratch(const Scratch &) = delete;
  Scratch &operator=(const Scratch &) = delete;
  const char *dir() const { return dir_.c_str(); }
  void replace(const char *file, const uint8_t *data, size_t size) const;
  void restore(const char *file) const;

 private:
  std::string dir_;
};

// Reads every item, converts, steps and searches through a locale; results are
// discarded: only crashes, leaks and out-of-bounds reads matter here.
void workout(VLLocale *locale, const uint8_t *text, size_t size);

// Consumes bytes from the front of the input.
struct Input {
  const uint8_t *p;
  size_t n;
  uint8_t byte() {
    if (!n) return 0;
    --n;
    return *p++;
  }
  uint32_t word() { return uint32_t(byte()) | uint32_t(byte()) << 8 | uint32_t(byte()) << 16 | uint32_t(byte()) << 24; }
};

}  // namespace fuzz
