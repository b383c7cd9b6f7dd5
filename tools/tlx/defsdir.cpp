// Where the tool finds definitions: --dir, else VL_LOCALEDIR, else (only in the tool built
// for the build tree) the build's own definitions; null leaves the choice to the library,
// whose built-in location an install links to the installed definitions.
#include <cstdlib>
#include <sys/stat.h>

#include "tools/tlx/tlx.h"

#ifndef VL_DEFAULT_DEFS
#define VL_DEFAULT_DEFS ""
#endif

const char *defsDir(const char *given) {
  if (given) return given;
  if (const char *env = std::getenv("VL_LOCALEDIR")) return env;
  struct stat st;
  if (*VL_DEFAULT_DEFS && stat(VL_DEFAULT_DEFS, &st) == 0) return VL_DEFAULT_DEFS;
  return nullptr;
}
