// Message catalog files, opened in file mode and in in-memory mode by callers in
// other code pages.
#include <cstdio>
#include <string>
#include <unistd.h>

#include "tests/fuzz/fuzzdefs.h"

namespace {
VLLocale *callers[3];
std::string dir;
}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  VLInit(fuzz::realDefs(), nullptr, nullptr, 0, 0);
  uint32_t rc;
  const char *names[] = {"German_Germany.UTF-8", "Japanese_Japan.IBM930", "Japanese_Japan.MS932"};
  for (int i = 0; i < 3; ++i) callers[i] = VLGetLocale(names[i], 0, &rc);
  char tmpl[] = "/tmp/vlfuzzcat.XXXXXX";
  if (mkdtemp(tmpl)) dir = tmpl;
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  if (dir.empty() || size < 1) return 0;
  uint8_t pick = data[0];
  std::string path = dir + "/fz.cat";
  if (FILE *f = std::fopen(path.c_str(), "wb")) {
    std::fwrite(data + 1, 1, size - 1, f);
    std::fclose(f);
  }
  VLLocale *caller = callers[pick % 3];
  uint32_t options = (pick & 0x80) ? 0x80000061u : 0x80000060u;
  std::string tmpl = dir + "/%N";
  VLCatalog *cat = VLOpenCatalog(caller, tmpl.c_str(), "fz.cat", options);
  if (!cat) return 0;
  char buf[64];
  VLUChar u[64];
  for (uint32_t set = 0; set < 4; ++set)
    for (uint32_t msg = 0; msg < 6; ++msg) {
      VLGetMessage(cat, set, msg, buf, sizeof buf, "default", 0);
      VLGetMessage(cat, set, msg, buf, 3, nullptr, 0);
      VLGetMessageU(cat, set, msg, u, 64, nullptr, 0);
    }
  VLGetMessage(cat, 0xFFFFFFFFu, 0xFFFFFFFFu, buf, sizeof buf, nullptr, 0);
  VLCloseCatalog(cat);
  return 0;
}
