// Code page objects of every kind: single-byte, double-byte, multi-byte, shift-sensitive, UTF-8.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"cp_01252.nls", "German_Germany.MS1252"},
      {"cp_00932.nls", "Japanese_Japan.MS932"},
      {"cp_00954.nls", "Japanese_Japan.954"},
      {"cp_00930.nls", "Japanese_Japan.IBM930"},
      {"cp_57352.nls", "German_Germany.UTF-8"},
      {"cp_00037.nls", "English_UnitedStates.37"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
