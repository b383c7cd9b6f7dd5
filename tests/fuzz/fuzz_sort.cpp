// Sort objects: a locale collating by the replaced sort is worked through.
#include "tests/fuzz/objfile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  static const fuzz::Target targets[] = {
      {"so_00001.nls", "English_UnitedStates.Latin1@Default"},
      {"so_00002.nls", "German_Germany.MS1252@Croatian"},
      {"so_00010.nls", "German_Germany.UTF-8@Swedish"},
  };
  return fuzz::runObjectFile(targets, data, size);
}
