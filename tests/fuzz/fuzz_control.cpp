// The control file: every object of the directory is found through it.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"control.nls", "German_Germany.MS1252"},
      {"control.nls", "Japanese_Japan.IBM930"},
      {"control.nls", "Japanese_Japan.MS932"},
      {"control.nls", "Russian_Russia.UTF-8"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
