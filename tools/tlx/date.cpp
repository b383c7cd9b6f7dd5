// tlx date [--locale NAME] [--format PATTERN|--short|--long|--time] [--time-value T]
//          [--parse TEXT] [--raw] [--dir DIR]: writes a time as a locale does, or reads one
// back by a pattern and prints its fields.
#include <clocale>
#include <cstdio>
#include <cstring>
#include <ctime>
#include <langinfo.h>
#include <strings.h>
#include <string>

#include "tools/tlx/tlx.h"

namespace {

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx date [--locale NAME] [--format PATTERN|--short|--long|--time]\n"
               "                [--time-value \"YYYY-MM-DD HH:MM:SS\"] [--raw] [--dir DIR]\n"
               "       tlx date --parse TEXT --format PATTERN [--locale NAME] [--dir DIR]\n"
               "  Writes the time (now, or --time-value) as the locale writes it: by PATTERN, the\n"
               "  short date (--short, %%x), the long date (--long, %%#x), the time (--time, %%X),\n"
               "  else date and time (%%c). Directives: %%a %%A %%b %%B %%c %%d %%H %%I %%j %%m %%M %%p\n"
               "  %%S %%U %%w %%W %%x %%X %%y %%Y %%%%, and '#' before the letter for no leading zeros\n"
               "  (%%#x, %%#c: the long date). %%j counts from 000.\n"
               "  --parse reads TEXT by PATTERN and prints the fields it named.\n"
               "  --locale   language_territory.codepage (default: the user's locale)\n"
               "  --raw      write the bytes in the locale's code page, shift bytes included\n"
               "  --dir DIR  definitions directory (else VL_LOCALEDIR, the built one)\n"
               "  PATTERN and TEXT are taken as UTF-8. Exit status: 0 done, 1 refused by the\n"
               "  library (its return code is shown), 2 bad usage.\n");
}

// UTF-8 into UTF-16; false on anything that is not UTF-8 of the BMP.
bool toUtf16(const char *s, std::u16string *out) {
  const auto *p = reinterpret_cast<const unsigned char *>(s);
  while (*p) {
    unsigned c = *p++, extra = 0;
    if (c >= 0xE0 && c < 0xF0) c &= 0x0F, extra = 2;
    else if (c >= 0xC2 && c < 0xE0) c &= 0x1F, extra = 1;
    else if (c >= 0x80) return false;
    for (; extra; --extra) {
      if ((*p & 0xC0) != 0x80) return false;
      c = c << 6 | (*p++ & 0x3F);
    }
    out->push_back(static_cast<char16_t>(c));
  }
  return true;
}

const char *meaning(int32_t rc) {
  switch (rc) {
    case 2: return "invalid argument";
    case 35: return "unknown information item";
    case 37: return "text does not match, or a field out of range or unsupported directive";
    case 40: return "output too long";
    case 51: return "malformed pattern";
    default: return "error";
  }
}

// "YYYY-MM-DD HH:MM:SS" into a broken-down time with its weekday and day of the year.
bool timeValue(const char *s, std::tm *t) {
  int y, mo, d, h, mi, se;
  char tail;
  if (std::sscanf(s, "%d-%d-%d %d:%d:%d%c", &y, &mo, &d, &h, &mi, &se, &tail) != 6) return false;
  if (y < 0 || y > 9999 || mo < 1 || mo > 12 || d < 1 || d > 31 || h < 0 || h > 23 || mi < 0 || mi > 59 || se < 0 ||
      se > 59)
    return false;
  std::tm v{};
  v.tm_year = y - 1900, v.tm_mon = mo - 1, v.tm_mday = d, v.tm_hour = h, v.tm_min = mi, v.tm_sec = se;
  std::time_t when = timegm(&v);
  if (!gmtime_r(&when, t)) return false;
  return t->tm_mday == d;  // 31 February would have moved on
}

void field(const char *name, int v, int shown) {
  if (v == -999) std::printf("%-9s -\n", name);
  else std::printf("%-9s %d\n", name, shown);
}

}  // namespace

int cmdDate(int argc, char **argv) {
  const char *name = nullptr, *pattern = nullptr, *value = nullptr, *text = nullptr, *dir = nullptr;
  bool raw = false;
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    const bool more = i + 1 < argc;
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) {
      help(stdout);
      return 0;
    } else if (!std::strcmp(a, "--locale") && more) {
      name = argv[++i];
    } else if (!std::strcmp(a, "--format") && more && !pattern) {
      pattern = argv[++i];
    } else if (!std::strcmp(a, "--short") && !pattern) {
      pattern = "%x";
    } else if (!std::strcmp(a, "--long") && !pattern) {
      pattern = "%#x";
    } else if (!std::strcmp(a, "--time") && !pattern) {
      pattern = "%X";
    } else if (!std::strcmp(a, "--time-value") && more) {
      value = argv[++i];
    } else if (!std::strcmp(a, "--parse") && more) {
      text = argv[++i];
    } else if (!std::strcmp(a, "--raw")) {
      raw = true;
    } else if (!std::strcmp(a, "--dir") && more) {
      dir = argv[++i];
    } else {
      std::fprintf(stderr, "tlx date: unexpected argument '%s'\n", a);
      help(stderr);
      return 2;
    }
  }
  if ((text && (!pattern || value || raw))) {
    std::fprintf(stderr, "tlx date: --parse takes --format and no --time-value or --raw\n");
    return 2;
  }
  std::tm t{};
  if (value && !timeValue(value, &t)) {
    std::fprintf(stderr, "tlx date: bad --time-value '%s' (YYYY-MM-DD HH:MM:SS)\n", value);
    return 2;
  }
  if (!value) {
    std::time_t now = std::time(nullptr);
    localtime_r(&now, &t);
  }
  std::u16string p, in;
  if (!toUtf16(pattern ? pattern : "%c", &p) || (text && !toUtf16(text, &in))) {
    std::fprintf(stderr, "tlx date: %s is not UTF-8\n", text && !toUtf16(text, &in) ? "--parse" : "--format");
    return 2;
  }
  std::setlocale(LC_CTYPE, "");
  const bool utf8 = !strcasecmp(nl_langinfo(CODESET), "UTF-8");

  uint32_t irc = VLInit(defsDir(dir), nullptr, nullptr, 0, 0);
  if (irc != VL_RC_OK && irc != VL_RC_DEFAULTS) {
    std::fprintf(stderr, "tlx date: initialisation failed, rc %u\n", irc);
    return 1;
  }
  uint32_t rc = 0;
  VLLocale *l = VLGetLocale(name ? name : "", name ? 0 : VL_LOCALE_USER | VL_LOCALE_FALLBACK, &rc);
  if (!l) {
    std::fprintf(stderr, "tlx date: no locale '%s', rc %u\n", name ? name : "", rc);
    VLTerm();
    return 1;
  }
  const auto *pu = reinterpret_cast<const VLUChar *>(p.c_str());
  int status = 0;
  if (text) {
    std::tm r{};
    r.tm_year = r.tm_mon = r.tm_mday = r.tm_hour = r.tm_min = r.tm_sec = r.tm_wday = r.tm_yday = -999;
    int32_t n = VLStringToTimeU(l, &r, reinterpret_cast<const VLUChar *>(in.c_str()), -1, pu, -1, 0);
    if (n < 0) {
      std::fprintf(stderr, "tlx date: cannot read '%s' by '%s': rc %d, %s\n", text, pattern, VLGetError(l),
                   meaning(VLGetError(l)));
      status = 1;
    } else {
      field("year", r.tm_year, r.tm_year + 1900);
      field("month", r.tm_mon, r.tm_mon + 1);
      field("day", r.tm_mday, r.tm_mday);
      field("hour", r.tm_hour, r.tm_hour);
      field("minute", r.tm_min, r.tm_min);
      field("second", r.tm_sec, r.tm_sec);
      field("weekday", r.tm_wday, r.tm_wday);
      field("yearday", r.tm_yday, r.tm_yday);
      std::printf("read      %d of %zu characters\n", n, in.size());
    }
  } else if (raw) {
    // The pattern goes into the locale's code page first, as a caller there would write it.
    char pb[1024], out[1024];
    int32_t np = p.size() > 200 ? -1 : VLCpUnicodeToStr(l->codePage, pu, -1, 0, reinterpret_cast<unsigned char *>(pb));
    int32_t n = np < 0 ? -1 : VLTimeToString(l, &t, out, sizeof out, pb, np, 0);
    if (n < 0) status = 1;
    else std::fwrite(out, 1, static_cast<size_t>(n), stdout);
  } else {
    VLUChar out[1024];
    int32_t n = VLTimeToStringU(l, &t, out, 1024, pu, -1, VL_OPT_NULLTERM);
    if (n < 0) status = 1;
    else std::printf("%s\n", forTerminal(out, utf8).c_str());
  }
  if (status && !text)
    std::fprintf(stderr, "tlx date: cannot write by '%s': rc %d, %s\n", pattern ? pattern : "%c", VLGetError(l),
                 meaning(VLGetError(l)));
  VLReleaseLocale(l);
  VLTerm();
  return status;
}
