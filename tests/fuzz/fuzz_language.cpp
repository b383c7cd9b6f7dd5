// Language objects.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"la_00010.nls", "German_Germany.MS1252"},
      {"la_00016.nls", "Japanese_Japan.IBM930"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
