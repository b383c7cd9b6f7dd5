// The alias file: code page names in locale names resolve through it.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"alias.txt", "German_Germany.ISO-8859-1"},
      {"alias.txt", "Japanese_Japan.Shift_JIS"},
      {"alias.txt", "German_Germany.x"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
