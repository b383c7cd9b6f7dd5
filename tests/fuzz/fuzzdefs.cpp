#include "tests/fuzz/fuzzdefs.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dirent.h>
#include <unistd.h>
#include <ctime>
#include <vector>

namespace fuzz {

const char *realDefs() { return VL_FUZZ_DEFS; }

Scratch::Scratch() {
  char tmpl[] = "/tmp/vlfuzz.XXXXXX";
  if (!mkdtemp(tmpl)) std::abort();
  dir_ = tmpl;
  DIR *d = opendir(realDefs());
  if (!d) std::abort();
  while (dirent *e = readdir(d)) {
    if (e->d_name[0] == '.') continue;
    restore(e->d_name);
  }
  closedir(d);
}

Scratch::~Scratch() {
  if (DIR *d = opendir(dir_.c_str())) {
    while (dirent *e = readdir(d))
      if (e->d_name[0] != '.') unlink((dir_ + "/" + e->d_name).c_str());
    closedir(d);
  }
  rmdir(dir_.c_str());
}

void Scratch::replace(const char *file, const uint8_t *data, size_t size) const {
  std::string path = dir_ + "/" + file;
  unlink(path.c_str());
  FILE *f = std::fopen(path.c_str(), "wb");
  if (!f) std::abort();
  if (size) std::fwrite(data, 1, size, f);
  std::fclose(f);
}

void Scratch::restore(const char *file) const {
  std::string path = dir_ + "/" + file, real = std::string(realDefs()) + "/" + file;
  unlink(path.c_str());
  if (symlink(real.c_str(), path.c_str()) != 0) std::abort();
}

void workout(VLLocale *l, const uint8_t *text, size_t size) {
  if (!l) return;
  char buf[256];
  VLUChar ubuf[128];
  VLWChar wbuf[64];
  for (int32_t item = 0; item <= VL_ITEM_LAST + 1; ++item) {
    VLGetLocaleNumInfo(l, item, 0);
    VLGetLocaleTextInfo(l, item, buf, sizeof buf, 0);
    VLGetLocaleTextInfoU(l, item, ubuf, 128, 0);
    VLGetLocaleTextInfoW(l, item, wbuf, 64, 0);
    VLGetLocaleTextInfo(l, item, buf, 3, 0);
  }
  // The text exactly as long as given, in a block of its own, so reads past it are seen.
  std::vector<char> s(text, text + size);
  std::vector<VLUChar> u(size * 2 + 2);
  int32_t n = VLStringToUnicode(u.data(), int32_t(u.size()), l, s.data(), int32_t(size), 0);
  if (n > 0) {
    std::vector<char> back(size * 4 + 8);
    VLUnicodeToString(l, back.data(), int32_t(back.size()), u.data(), n, 0);
    VLUnicodeToString(l, back.data(), 5, u.data(), n, VL_OPT_NULLTERM);
  }
  VLNumChars(l, s.data(), int32_t(size));
  int32_t steps = 0;
  for (const char *p = s.data(), *end = s.data() + size; p && p < end && steps < 4096; ++steps) {
    // Calls without a length take a whole character: never hand them a cut one.
    if (VLByteLength(l, p) > end - p) break;
    VLGetCharType(l, p, 0);
    p = VLNextChar(l, p);
  }
  uint32_t kind;
  int32_t eolLength;
  VLGetEol(l, s.data(), int32_t(size), &kind, &eolLength, VL_EOL_LF | VL_EOL_CRLF);
  VLStrcpy(l, buf, sizeof buf, s.data(), int32_t(size), 0);
  VLStrcpy(l, buf, 4, s.data(), int32_t(size), VL_OPT_NULLTERM);
  VLStrspn(l, s.data(), int32_t(size), " ,.", 3, 0);

  // The families built on the handle: mapping, comparison, collation, numbers, times.
  std::vector<char> mapped(size * 3 + 4);
  VLMapString(l, mapped.data(), int32_t(mapped.size()), s.data(), int32_t(size), VL_MAP_UPPER);
  VLMapString(l, mapped.data(), 3, s.data(), int32_t(size), VL_MAP_LOWER);
  const char other[] = "Stra\xDF" "e";
  VLStrcmp(l, s.data(), int32_t(size), other, 6, VL_CMP_NOWIDTH);
  VLStrcoll(l, s.data(), int32_t(size), other, 6, 0);
  VLStrcoll(l, s.data(), int32_t(size), s.data(), int32_t(size / 2), VL_COLL_IGNORECASE);
  std::vector<char> key(size * 12 + 16);
  VLStrxfrm(l, key.data(), int32_t(key.size()), s.data(), int32_t(size), 0);
  VLStrxfrm(l, key.data(), 5, s.data(), int32_t(size), 0);
  VLStrstr(l, s.data(), int32_t(size), "ab", 2, VL_COLL_IGNORECASE);
  VLLongToString(l, -1234567, buf, sizeof buf, 0);
  VLLongToString(l, 2147483647, buf, 4, 0);
  VLCurrencyToString(l, buf, sizeof buf, 0, -1234.567);
  VLDoubleToString(l, 98765.4321, buf, 6, 0);
  char *end = nullptr;
  VLStringToLong(l, s.data(), int32_t(size), &end, 0, 0);
  VLStringToDouble(l, s.data(), int32_t(size), &end, 0);
  struct tm t {};
  t.tm_year = 126, t.tm_mon = 10, t.tm_mday = 23, t.tm_hour = 13, t.tm_min = 5, t.tm_wday = 1, t.tm_yday = 326;
  VLTimeToString(l, &t, buf, sizeof buf, "%c|%x|%X|%A %B %p", -1, 0);
  VLTimeToString(l, &t, buf, 7, "%#c", -1, 0);
  struct tm back = t;
  VLStringToTime(l, &back, s.data(), int32_t(size), "%x", -1, 0);
}

}  // namespace fuzz
