#include "tests/fuzz/fuzzdefs.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <dirent.h>
#include <unistd.h>
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
    VLGetCharType(l, p, 0);
    if (VLByteLength(l, p) > end - p) break;
    p = VLNextChar(l, p);
  }
  uint32_t kind;
  int32_t eolLength;
  VLGetEol(l, s.data(), int32_t(size), &kind, &eolLength, VL_EOL_LF | VL_EOL_CRLF);
  VLStrcpy(l, buf, sizeof buf, s.data(), int32_t(size), 0);
  VLStrcpy(l, buf, 4, s.data(), int32_t(size), VL_OPT_NULLTERM);
  VLStrspn(l, s.data(), int32_t(size), " ,.", 3, 0);
}

}  // namespace fuzz
