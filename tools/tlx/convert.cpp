#include <cstdio>

#include "tools/tlx/tlx.h"

int cmdConvert(int, char **) {
  std::fprintf(stderr, "tlx convert: not available in this build\n");
  return 2;
}
