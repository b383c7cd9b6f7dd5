// tlx locale NAME [--dir DIR]: builds a locale and prints its parts.
#include <cstdio>
#include <cstring>
#include <string>

#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {
const char *entryName(const VLObjEntry *e, const char *none) { return e ? e->name : none; }

// UTF-16 to UTF-8 for the terminal.
std::string utf8(const VLUChar *u) {
  std::string out;
  for (; u && *u; ++u) {
    unsigned c = *u;
    if (c < 0x80) {
      out += static_cast<char>(c);
    } else if (c < 0x800) {
      out += static_cast<char>(0xC0 | c >> 6);
      out += static_cast<char>(0x80 | (c & 0x3F));
    } else {
      out += static_cast<char>(0xE0 | c >> 12);
      out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (c & 0x3F));
    }
  }
  return out;
}

std::string hex(const char *s) {
  std::string out;
  char b[4];
  for (; s && *s; ++s) {
    std::snprintf(b, sizeof b, "%02X", static_cast<unsigned char>(*s));
    if (!out.empty()) out += ' ';
    out += b;
  }
  return out;
}
}  // namespace

int cmdLocale(int argc, char **argv) {
  const char *name = nullptr, *dir = nullptr;
  for (int i = 1; i < argc; ++i) {
    if (!std::strcmp(argv[i], "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (!std::strcmp(argv[i], "--help")) {
      std::printf("usage: tlx locale NAME [--dir DIR]\n"
                  "Builds the locale NAME (language_territory.codepage@sort; any part after the\n"
                  "language may be left out) from the definitions in DIR and shows its parts.\n");
      return 0;
    } else if (!name) {
      name = argv[i];
    } else {
      std::fprintf(stderr, "tlx locale: unexpected argument '%s'\n", argv[i]);
      return 2;
    }
  }
  if (!name) name = "";
  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  std::printf("init          rc %u%s\n", irc, irc == VL_RC_DEFAULTS ? " (no definitions found: built-in locale)" : "");
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) return 1;
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name, VL_LOCALE_FALLBACK, &rc);
  std::printf("locale        \"%s\" rc %u\n", name, rc);
  int status = 1;
  if (l) {
    const VLObjEntry *cp = l->codePage;
    std::printf("language      %s (id %u)\n", entryName(l->language, "-"), l->language ? l->language->id : 0);
    std::printf("territory     %s (id %u)\n", entryName(l->territory, "-"), l->territory ? l->territory->id : 0);
    std::printf("code page     %s (id %u)\n", entryName(cp, "-"), cp ? cp->id : 0);
    std::printf("sort          %s\n", entryName(l->sort, "Binary"));
    std::printf("flags         0x%04x%s%s%s\n", l->flags, (l->flags & VL_LF_SINGLEBYTE) ? " single-byte" : "",
                (l->flags & VL_LF_BINARY) ? " binary-order" : "", (l->flags & VL_LF_SHIFT) ? " shift-sensitive" : "");
    std::printf("currency      %s (in the code page: %s)\n", utf8(l->textsU[1]).c_str(), hex(l->texts[1]).c_str());
    std::printf("time format   %s\n", utf8(l->textsU[5]).c_str());
    std::printf("last error    %d\n", VLGetError(l));
    VLReleaseLocale(l);
    status = 0;
  }
  VLTerm();
  return status;
}
