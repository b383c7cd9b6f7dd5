// tlx format number|currency [--locale NAME] [--intl] [--dir DIR] VALUE...
// tlx parse number [--locale NAME] [--money] [--dir DIR] TEXT...
// Writes numbers and amounts as a locale does, and reads them back. Text is UTF-8 on
// both sides; with no VALUE or TEXT one is read per line from standard input.
#include <cerrno>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

std::u16string fromUtf8(const std::string &s, size_t *bad) {
  std::u16string u;
  *bad = SIZE_MAX;
  for (size_t i = 0; i < s.size();) {
    unsigned char b = static_cast<unsigned char>(s[i]);
    unsigned n = b < 0x80 ? 1 : (b >> 5) == 6 ? 2 : (b >> 4) == 14 ? 3 : 0;
    if (!n || i + n > s.size()) {
      *bad = i;
      return u;
    }
    char32_t c = n == 1 ? b : n == 2 ? b & 0x1F : b & 0x0F;
    for (unsigned k = 1; k < n; ++k) {
      unsigned char t = static_cast<unsigned char>(s[i + k]);
      if ((t & 0xC0) != 0x80) {
        *bad = i;
        return u;
      }
      c = (c << 6) | (t & 0x3F);
    }
    u += static_cast<char16_t>(c);
    i += n;
  }
  return u;
}

std::string toUtf8(const VLUChar *u, int32_t n) {
  std::string s;
  for (int32_t i = 0; i < n && u[i]; ++i) appendUtf8(s, u[i]);
  return s;
}

// Byte offset in the UTF-8 text of the n-th UTF-16 unit.
size_t byteOffset(const std::string &s, size_t units) {
  size_t i = 0;
  for (size_t k = 0; k < units && i < s.size(); ++k) {
    unsigned char b = static_cast<unsigned char>(s[i]);
    i += b < 0x80 ? 1 : (b >> 5) == 6 ? 2 : 3;
  }
  return i;
}

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx format number|currency [--locale NAME] [--intl] [--dir DIR] VALUE...\n"
               "       tlx parse number [--locale NAME] [--money] [--dir DIR] TEXT...\n"
               "  format writes each VALUE (C notation: 1234, -5, 1234.5678) as LOCALE writes\n"
               "  it: an integer that fits 32 bits with the locale's grouping, any other value\n"
               "  cut (not rounded) to the locale's precision; currency writes the amount with\n"
               "  the local symbol, or with --intl the international one.\n"
               "  parse reads each TEXT by the locale's separators (--money: the monetary ones)\n"
               "  and prints its value in C notation.\n"
               "  With no VALUE or TEXT, one is read per line from standard input.\n"
               "  Text is UTF-8. Exit status: 0 all done, 1 a value could not be read, 2 bad usage.\n");
}

struct Run {
  const char *cmd;
  VLLocale *l;
  bool intl, money, currency;
  int status = 0;
};

void bad(Run &r, const char *where, const std::string &text, size_t at, const char *why) {
  std::fflush(stdout);  // the message follows the values before it
  std::fprintf(stderr, "tlx %s: %s, byte %zu: %s: '%s'\n", r.cmd, where, at, why, text.c_str());
  r.status = 1;
}

void formatOne(Run &r, const std::string &text, const char *where) {
  errno = 0;
  char *end = nullptr;
  const char *s = text.c_str();
  double d = std::strtod(s, &end);
  if (end == s || *end || errno == ERANGE) {
    bad(r, where, text, static_cast<size_t>(end - s), "not a number");
    return;
  }
  VLUChar out[1200];
  int32_t n;
  long whole = std::strtol(s, &end, 10);
  if (r.currency)
    n = VLCurrencyToStringU(r.l, out, 1200, r.intl ? VL_NUM_INTL : 0, d);
  else if (!*end && errno != ERANGE && whole >= INT32_MIN && whole <= INT32_MAX)
    n = VLLongToStringU(r.l, static_cast<int32_t>(whole), out, 1200, 0);
  else
    n = VLDoubleToStringU(r.l, d, out, 1200, 0);
  if (n < 0 || VLGetError(r.l) != 0) {
    bad(r, where, text, 0, ("rc " + std::to_string(VLGetError(r.l))).c_str());
    return;
  }
  std::printf("%s\n", toUtf8(out, n).c_str());
}

void parseOne(Run &r, const std::string &text, const char *where) {
  size_t badAt;
  std::u16string u = fromUtf8(text, &badAt);
  if (badAt != SIZE_MAX) {
    bad(r, where, text, badAt, "not UTF-8");
    return;
  }
  const auto *s = reinterpret_cast<const VLUChar *>(u.data());
  const int32_t len = static_cast<int32_t>(u.size());
  const uint32_t opts = r.money ? VL_NUM_MONEY : 0;
  VLUChar *end = nullptr;
  int32_t v = VLStringToLongU(r.l, s, len, &end, 10, opts);
  size_t used = static_cast<size_t>(end - s);
  if (used == u.size() && used > 0) {
    std::printf("%d\n", v);
    return;
  }
  double d = VLStringToDoubleU(r.l, s, len, &end, opts);
  used = static_cast<size_t>(end - s);
  if (used == u.size() && used > 0) {
    std::printf("%.17g\n", d);
    return;
  }
  bad(r, where, text, byteOffset(text, used), "not a number here");
}

}  // namespace

// Both commands: options, the library, then each value from the arguments or the lines.
static int numberCommand(const char *cmd, int argc, char **argv) {
  const char *name = "", *dir = nullptr, *kind = nullptr;
  Run r{cmd, nullptr, false, false, false};
  std::vector<std::string> values;
  const bool parse = !std::strcmp(cmd, "parse");
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) {
      help(stdout);
      return 0;
    } else if (!std::strcmp(a, "--locale") && i + 1 < argc) {
      name = argv[++i];
    } else if (!std::strcmp(a, "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (!std::strcmp(a, "--intl") && !parse) {
      r.intl = true;
    } else if (!std::strcmp(a, "--money") && parse) {
      r.money = true;
    } else if (!kind && a[0] != '-') {
      kind = a;
    } else if (kind && (a[0] != '-' || (a[1] >= '0' && a[1] <= '9') || a[1] == '.')) {
      values.push_back(a);  // a value may start with its minus sign
    } else {
      std::fprintf(stderr, "tlx %s: unexpected argument '%s'\n", cmd, a);
      help(stderr);
      return 2;
    }
  }
  if (!kind || (std::strcmp(kind, "number") && (parse || std::strcmp(kind, "currency")))) {
    std::fprintf(stderr, "tlx %s: say what to %s: %s\n", cmd, cmd, parse ? "number" : "number or currency");
    help(stderr);
    return 2;
  }
  r.currency = !std::strcmp(kind, "currency");
  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx %s: initialisation failed, rc %u\n", cmd, irc);
    return 1;
  }
  uint32_t rc = 0;
  r.l = VLGetLocale(name, 0, &rc);
  if (!r.l) {
    std::fprintf(stderr, "tlx %s: no locale '%s', rc %u\n", cmd, name, rc);
    VLTerm();
    return 1;
  }
  auto one = [&](const std::string &v, const char *where) { parse ? parseOne(r, v, where) : formatOne(r, v, where); };
  if (!values.empty()) {
    for (size_t i = 0; i < values.size(); ++i) one(values[i], ("argument " + std::to_string(i + 1)).c_str());
  } else {
    std::string line;
    long lineNo = 0;
    for (int c; (c = std::getchar()) != EOF || !line.empty();) {
      if (c != '\n' && c != EOF) {
        line += static_cast<char>(c);
        continue;
      }
      if (!line.empty() && line.back() == '\r') line.pop_back();
      one(line, ("line " + std::to_string(++lineNo)).c_str());
      line.clear();
      if (c == EOF) break;
    }
  }
  std::fflush(stdout);
  VLReleaseLocale(r.l);
  VLTerm();
  return r.status;
}

int cmdFormat(int argc, char **argv) { return numberCommand("format", argc, argv); }
int cmdParse(int argc, char **argv) { return numberCommand("parse", argc, argv); }
