// mkctype [--ucd DIR] CTYPE_OUTPUT [MAP_OUTPUT]: writes the Unicode tables of the library.
#include <cstdio>
#include <cstring>
#include <string>

#include "ctypegen.h"

int main(int argc, char **argv) {
  std::string ucd = "/usr/share/unicode", out, mapOut;
  for (int i = 1; i < argc; ++i) {
    if (!std::strcmp(argv[i], "--ucd") && i + 1 < argc)
      ucd = argv[++i];
    else if (out.empty())
      out = argv[i];
    else
      mapOut = argv[i];
  }
  if (out.empty()) {
    std::fprintf(stderr, "usage: mkctype [--ucd DIR] CTYPE_OUTPUT [MAP_OUTPUT]\n");
    return 2;
  }
  std::string err;
  if (!mkctype::writeCtypeSource(ucd, out, &err, mapOut)) {
    std::fprintf(stderr, "mkctype: %s\n", err.c_str());
    return 1;
  }
  return 0;
}
