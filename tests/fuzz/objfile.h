// One harness per kind of definition file: the input, after a selector byte, replaces
// one generated file; the library is started on that directory and a locale that
// needs the file is built and worked through.
#pragma once
#include <cstddef>
#include <cstdint>

#include "tests/fuzz/fuzzdefs.h"

namespace fuzz {

struct Target {
  const char *file;    // the file the input replaces
  const char *locale;  // a locale that loads it
};

template <size_t N>
int runObjectFile(const Target (&targets)[N], const uint8_t *data, size_t size) {
  static Scratch scratch;
  Input in{data, size};
  uint8_t pick = in.byte();
  const Target &t = targets[pick % N];
  scratch.replace(t.file, in.p, in.n);
  // Half the runs refuse the built-in substitutes, so the failure paths run too.
  uint32_t options = (pick & 0x80) ? VL_OPT_NOBUILTIN : 0;
  VLInit(scratch.dir(), nullptr, nullptr, 0, options);
  uint32_t rc = 0;
  static const uint8_t text[] = "Gr\xC3\xBC\xC3\x9F" "e 12,5 \x0E\x45\x41\x0F\r\nabc \x82\xA0";
  if (VLLocale *l = VLGetLocale(t.locale, VL_LOCALE_FALLBACK, &rc)) {
    workout(l, text, sizeof text - 1);
    VLReleaseLocale(l);
  }
  VLTerm();
  scratch.restore(t.file);
  return 0;
}

}  // namespace fuzz
