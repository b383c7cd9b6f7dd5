#include <cstdio>

#include "tools/tlx/tlx.h"

int cmdTranslate(int, char **) {
  std::fprintf(stderr, "tlx translate: not available in this build\n");
  return 2;
}
