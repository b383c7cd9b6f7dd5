// Territory objects.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"te_00276.nls", "German_Germany.MS1252"},
      {"te_00392.nls", "Japanese_Japan.IBM930"},
      {"te_00276.nls", "German_Germany.UTF-8"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
