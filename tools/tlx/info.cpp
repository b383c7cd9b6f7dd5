// tlx info LOCALE [--items N,...] [--defaults] [--user] [--dir DIR]: prints the
// information items of a locale, numbered and named, marking the overridden ones.
#include <clocale>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <langinfo.h>
#include <strings.h>
#include <string>
#include <vector>

#include "tools/tlx/tlx.h"
#include "veltrin.h"

namespace {

const char *const kNames[VL_ITEM_LAST + 1] = {
    nullptr,
    "language id", "language name", "language text 1", "language text 2",
    "territory id", "territory name", "territory text 1", "territory text 2",
    "code page id", "code page name", "sort id", "sort name",
    "default territory", "default code page", "default sort",
    "Sunday", "Monday", "Tuesday", "Wednesday", "Thursday", "Friday", "Saturday",
    "Sun", "Mon", "Tue", "Wed", "Thu", "Fri", "Sat",
    "January", "February", "March", "April", "May", "June", "July", "August", "September",
    "October", "November", "December", "month 13",
    "Jan", "Feb", "Mar", "Apr", "May (short)", "Jun", "Jul", "Aug", "Sep", "Oct", "Nov", "Dec", "month 13 (short)",
    "morning", "afternoon", "territory flag",
    "decimal separator", "thousands separator", "separator 3", "grouping", "precision",
    "currency symbol", "international currency", "monetary decimal", "monetary thousands",
    "monetary grouping", "local fraction digits", "international fraction digits",
    "positive sign", "negative sign",
    "symbol before positive", "blank after symbol (positive)", "symbol before negative",
    "blank after symbol (negative)", "positive sign position", "negative sign position",
    "time pattern", "short date pattern", "long date pattern",
    "territory flag 5", "territory flag 6", "territory number",
    "maximum character length", "ASCII-based", "shift-sensitive", "locale name"};

bool isNumeric(int i) {
  return i == 1 || i == 5 || i == 9 || i == 11 || i == 58 || i == 63 || i == 69 || i == 70 || (i >= 73 && i <= 78) ||
         (i >= 82 && i <= 87);
}

// The override bits of the handle for an item: setMask bit, or 0 when it has none.
uint32_t maskBit(int i) {
  static const int kOrder[] = {63, 69, 70, 73, 74, 75, 76, 82, 83, 77, 78, 59, 60, 61, 66, 67,
                               62, 64, 68, 71, 72, 79, 80, 81};
  for (int k = 0; k < 24; ++k)
    if (kOrder[k] == i) return 1u << k;
  return 0;
}

// "1,5,16-22" into item numbers; false on anything else.
bool parseItems(const char *s, std::vector<int> *out) {
  while (*s) {
    char *end;
    long a = std::strtol(s, &end, 10), b = a;
    if (end == s) return false;
    if (*end == '-') {
      const char *t = end + 1;
      b = std::strtol(t, &end, 10);
      if (end == t) return false;
    }
    if (a < 1 || b > VL_ITEM_LAST || a > b) return false;
    for (long i = a; i <= b; ++i) out->push_back(static_cast<int>(i));
    if (*end == ',') ++end;
    else if (*end) return false;
    s = end;
  }
  return !out->empty();
}

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx info LOCALE [--items N,...] [--defaults] [--user] [--dir DIR]\n"
               "  Prints the information items of LOCALE (language_territory.codepage@sort), numbered\n"
               "  and named. --items picks items (1-88, ranges like 16-22); --defaults shows the\n"
               "  territory's defaults instead of the handle's values; --user builds the user's\n"
               "  locale (VL_LANG, else the platform's) in place of LOCALE. Items the handle\n"
               "  overrides are marked '*'. Texts are shown in UTF-8 on a UTF-8 terminal, else as\n"
               "  ASCII with \\uXXXX escapes.\n");
}

}  // namespace

std::string forTerminal(const VLUChar *u, bool utf8) {
  std::string s;
  for (; *u; ++u) {
    unsigned c = *u;
    if (c >= 0x20 && c < 0x7F) {
      s += static_cast<char>(c);
    } else if (!utf8 || c < 0x20 || (c >= 0xD800 && c <= 0xDFFF)) {
      char e[8];
      std::snprintf(e, sizeof e, "\\u%04X", c);
      s += e;
    } else {
      appendUtf8(s, c);
    }
  }
  return s;
}

int cmdInfo(int argc, char **argv) {
  const char *name = nullptr, *dir = nullptr;
  bool defaults = false, user = false;
  std::vector<int> items;
  for (int i = 1; i < argc; ++i) {
    if (!std::strcmp(argv[i], "--dir") && i + 1 < argc) {
      dir = argv[++i];
    } else if (!std::strcmp(argv[i], "--items") && i + 1 < argc) {
      if (!parseItems(argv[++i], &items)) {
        std::fprintf(stderr, "tlx info: bad item list '%s' (numbers 1-%d, ranges a-b)\n", argv[i], VL_ITEM_LAST);
        return 2;
      }
    } else if (!std::strcmp(argv[i], "--defaults")) {
      defaults = true;
    } else if (!std::strcmp(argv[i], "--user")) {
      user = true;
    } else if (!std::strcmp(argv[i], "--help")) {
      help(stdout);
      return 0;
    } else if (!name && argv[i][0] != '-') {
      name = argv[i];
    } else {
      std::fprintf(stderr, "tlx info: unexpected argument '%s'\n", argv[i]);
      help(stderr);
      return 2;
    }
  }
  if (items.empty())
    for (int i = 1; i <= VL_ITEM_LAST; ++i) items.push_back(i);
  std::setlocale(LC_CTYPE, "");
  const bool utf8 = !strcasecmp(nl_langinfo(CODESET), "UTF-8");

  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx info: initialisation failed, rc %u\n", irc);
    return 1;
  }
  if (irc == VL_RC_DEFAULTS) std::printf("(no definitions found: built-in locale)\n");
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name ? name : "", user ? VL_LOCALE_USER : 0, &rc);
  if (!l) {
    std::fprintf(stderr, "tlx info: no locale '%s', rc %u\n", name ? name : "", rc);
    VLTerm();
    return 1;
  }
  const uint32_t source = defaults ? VL_OPT_DEFAULTS : 0;
  char whole[VL_LOCALE_STRING_SIZE];
  std::printf("%s%s\n", VLLocaleGetLocaleString(l, whole), defaults ? " (territory defaults)" : "");
  int status = 0;
  for (int item : items) {
    std::string value;
    if (isNumeric(item)) {
      int32_t v = VLGetLocaleNumInfo(l, item, static_cast<int32_t>(source));
      value = v < 0 ? "(rc " + std::to_string(VLGetError(l)) + ")" : std::to_string(v);
    } else {
      VLUChar u[512];
      int32_t n = VLGetLocaleTextInfoU(l, item, u, 512, source);
      value = n < 0 ? "(rc " + std::to_string(VLGetError(l)) + ")" : "\"" + forTerminal(u, utf8) + "\"";
    }
    if (value[0] == '(') status = 1;
    const bool overridden = !defaults && (l->setMask & maskBit(item)) != 0;
    std::printf("%3d %c %-30s %s\n", item, overridden ? '*' : ' ', kNames[item], value.c_str());
  }
  VLReleaseLocale(l);
  VLTerm();
  return status;
}
