// tlx sort [--locale NAME] [--ignore-case] [--ignore-width] [--reverse] [--unique] [--keys]
//          [--dir DIR] [FILE...]
// Sorts lines by a locale's collation, like sort under LC_COLLATE: one sort key per line,
// then a stable sort of the keys, so large inputs cost one key each rather than a
// comparison walk per pair.
#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstring>
#include <string>
#include <vector>

#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

constexpr int kUsage = 2;  // sort's status for trouble with the command line or a file

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx sort [--locale NAME] [--ignore-case] [--ignore-width] [--reverse] [--unique]\n"
               "                [--keys] [--dir DIR] [FILE...]\n"
               "  Writes the lines of FILEs (or standard input, also for '-') sorted by the collation\n"
               "  of locale NAME (default: the user's locale from the environment). --ignore-case\n"
               "  and --ignore-width compare without regard to case (and width); --unique keeps the\n"
               "  first of lines that collate equal; --keys writes each line's sort key in hex, a tab,\n"
               "  then the line. Exit status: 0 done, 1 a line could not be keyed, 2 bad usage or an\n"
               "  unreadable file.\n");
}

bool readAll(const char *name, std::string *out) {
  FILE *f = std::strcmp(name, "-") ? std::fopen(name, "rb") : stdin;
  if (!f) {
    std::fprintf(stderr, "tlx sort: cannot read %s: %s\n", name, std::strerror(errno));
    return false;
  }
  char buf[65536];
  size_t n;
  while ((n = std::fread(buf, 1, sizeof buf, f)) > 0) out->append(buf, n);
  const bool ok = !std::ferror(f);
  if (f != stdin) std::fclose(f);
  if (!ok) std::fprintf(stderr, "tlx sort: cannot read %s\n", name);
  return ok;
}

struct Line {
  std::string text, key;
};

}  // namespace

int cmdSort(int argc, char **argv) {
  const char *locName = nullptr, *dir = nullptr;
  uint32_t options = 0;
  bool reverse = false, unique = false, keys = false;
  std::vector<const char *> files;
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    if (!std::strcmp(a, "--help")) {
      help(stdout);
      return 0;
    } else if (!std::strcmp(a, "--locale") && i + 1 < argc) {
      locName = argv[++i];
    } else if (!std::strcmp(a, "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (!std::strcmp(a, "--ignore-case")) {
      if (options != VL_COLL_IGNOREWIDTH) options = VL_COLL_IGNORECASE;
    } else if (!std::strcmp(a, "--ignore-width")) {
      options = VL_COLL_IGNOREWIDTH;
    } else if (!std::strcmp(a, "--reverse") || !std::strcmp(a, "-r")) {
      reverse = true;
    } else if (!std::strcmp(a, "--unique") || !std::strcmp(a, "-u")) {
      unique = true;
    } else if (!std::strcmp(a, "--keys")) {
      keys = true;
    } else if (a[0] == '-' && a[1]) {
      std::fprintf(stderr, "tlx sort: unknown option '%s'\n", a);
      help(stderr);
      return kUsage;
    } else {
      files.push_back(a);
    }
  }
  if (files.empty()) files.push_back("-");

  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx sort: the library did not start (code %u)\n", irc);
    return kUsage;
  }
  uint32_t rc = 0;
  // Without --locale: the user's locale, else code order, as sort does in the C locale.
  VLLocale *l = VLGetLocale(locName ? locName : "", locName ? 0 : VL_LOCALE_USER, &rc);
  if (!l && !locName) l = VLGetLocale("English_UnitedStates.UTF-8@Binary", VL_LOCALE_FALLBACK, &rc);
  if (!l) {
    std::fprintf(stderr, "tlx sort: no locale '%s' (code %u)\n", locName ? locName : "(user)", rc);
    VLTerm();
    return kUsage;
  }

  int status = 0;
  std::vector<Line> lines;
  for (const char *name : files) {
    std::string text;
    if (!readAll(name, &text)) {
      status = kUsage;
      break;
    }
    for (size_t at = 0; at < text.size();) {
      size_t end = text.find('\n', at);
      if (end == std::string::npos) end = text.size();
      Line ln{text.substr(at, end - at), {}};
      const auto len = static_cast<int32_t>(ln.text.size());
      int32_t k = VLStrxfrm(l, nullptr, 0, ln.text.data(), len, options);
      if (k >= 0) {
        ln.key.resize(static_cast<size_t>(k));
        k = VLStrxfrm(l, ln.key.data(), k, ln.text.data(), len, options);
      }
      if (k < 0) {
        std::fprintf(stderr, "tlx sort: %s: byte offset %zu: the line cannot be keyed (code %d)\n", name, at,
                     static_cast<int>(VLGetError(l)));
        status = 1;
      }
      lines.push_back(std::move(ln));
      at = end + 1;
    }
  }
  if (status == 0) {
    std::stable_sort(lines.begin(), lines.end(), [&](const Line &a, const Line &b) {
      return reverse ? b.key < a.key : a.key < b.key;
    });
    const std::string *prev = nullptr;
    for (const Line &ln : lines) {
      if (unique && prev && *prev == ln.key) continue;
      prev = &ln.key;
      if (keys) {
        for (unsigned char c : ln.key) std::printf("%02X", c);
        std::putchar('\t');
      }
      std::fwrite(ln.text.data(), 1, ln.text.size(), stdout);
      std::putchar('\n');
    }
  }
  VLReleaseLocale(l);
  VLTerm();
  return status;
}
