#include <cstdio>

#include "tools/tlx/tlx.h"

int cmdInfo(int, char **) {
  std::fprintf(stderr, "tlx info: not available in this build\n");
  return 2;
}
