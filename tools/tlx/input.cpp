// Opening the inputs of the commands that read files like a filter.
#include <cerrno>
#include <cstring>

#include "tools/tlx/tlx.h"

Input::Input(const char *command, const char *path) {
  const bool isStdin = !path || !std::strcmp(path, "-");
  shown = isStdin ? "standard input" : path;
  f = isStdin ? stdin : std::fopen(path, "rb");
  if (!f) std::fprintf(stderr, "tlx %s: cannot open input file '%s': %s\n", command, shown, std::strerror(errno));
}

Input::~Input() {
  if (f && f != stdin) std::fclose(f);
}
