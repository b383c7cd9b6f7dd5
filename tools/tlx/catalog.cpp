// tlx catalog [--dir DIR] FILE.cat: lists a catalog as message source, each text
// converted into the terminal's locale, so that the listing compiles back.
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx catalog [--dir DIR] FILE.cat\n"
               "  Lists the sets and messages of a catalog as message source ($set n, then\n"
               "  'number text' lines, with \\n, \\\\ and \\ddd escapes), converted into the\n"
               "  terminal's locale (VL_LANG, LC_ALL, LANG).\n"
               "  Exit status: 0 success, 1 not a valid catalog, 2 bad usage.\n");
}

void show(const char *text) {
  for (const unsigned char *p = reinterpret_cast<const unsigned char *>(text); *p; ++p) {
    if (*p == '\\') std::fputs("\\\\", stdout);
    else if (*p == '\n') std::fputs("\\n", stdout);
    else if (*p < 0x20 || *p == 0x7F) std::printf("\\%03o", *p);
    else std::putchar(*p);
  }
  std::putchar('\n');
}

}  // namespace

int cmdCatalog(int argc, char **argv) {
  const char *file = nullptr, *dir = nullptr;
  for (int i = 1; i < argc; ++i) {
    if (!std::strcmp(argv[i], "--help") || !std::strcmp(argv[i], "-h")) return help(stdout), 0;
    if (!std::strcmp(argv[i], "--dir") && i + 1 < argc) dir = argv[++i];
    else if (file || argv[i][0] == '-') return help(stderr), 2;
    else file = argv[i];
  }
  if (!file) return help(stderr), 2;
  if (VLInit(defsDir(dir), nullptr, nullptr, 0, 0) >= VL_RC_NOMEM) {
    std::fprintf(stderr, "tlx catalog: the library could not start\n");
    return 1;
  }
  uint32_t rc = 0;
  VLLocale *term = VLGetLocale("", VL_LOCALE_USER | VL_LOCALE_FALLBACK, &rc);
  // The name is a path: it is tried as it stands.
  VLCatalog *cat = VLOpenCatalog(term, nullptr, file, VL_CAT_INMEMORY);
  int status = 0;
  if (!cat) {
    std::fprintf(stderr, "tlx catalog: %s: not found or not a valid catalog (rc %d)\n", file, VLGetError(term));
    status = 1;
  } else {
    std::vector<char> buf;
    for (uint32_t s = 0; s < cat->setCount; ++s) {
      const VLMcSet &set = cat->sets[s];
      std::printf("$set %u\n", set.number);
      for (uint32_t m = 0; m < set.count; ++m) {
        buf.assign(set.index[m].length * size_t{4} + 8, '\0');
        VLGetMessage(cat, set.number, set.index[m].number, buf.data(), static_cast<int32_t>(buf.size()), nullptr, 0);
        std::printf("%u ", set.index[m].number);
        show(buf.data());
      }
    }
    VLCloseCatalog(cat);
  }
  if (term) VLReleaseLocale(term);
  VLTerm();
  return status;
}
