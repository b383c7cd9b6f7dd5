// Message sources, compiled by tlx gencat in a code page chosen by the first byte.
#include <cstdio>
#include <string>
#include <fcntl.h>
#include <unistd.h>

#include "tests/fuzz/fuzzdefs.h"
#include "tools/tlx/tlx.h"

namespace {
std::string dir;
}  // namespace

extern "C" int LLVMFuzzerInitialize(int *, char ***) {
  char tmpl[] = "/tmp/vlfuzzmsg.XXXXXX";
  if (mkdtemp(tmpl)) dir = tmpl;
  return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const uint8_t *data, size_t size) {
  if (dir.empty() || size < 1) return 0;
  const char *locales[] = {"German_Germany.MS1252", "Japanese_Japan.MS932", "Japanese_Japan.IBM930",
                           "German_Germany.UTF-8"};
  std::string src = dir + "/in.msg", out = dir + "/out.cat";
  if (FILE *f = std::fopen(src.c_str(), "wb")) {
    std::fwrite(data + 1, 1, size - 1, f);
    std::fclose(f);
  }
  unlink(out.c_str());
  std::string defs = fuzz::realDefs();
  const char *argv[] = {"gencat", "--dir", defs.c_str(), "--locale", locales[data[0] % 4], out.c_str(),
                        src.c_str(), nullptr};
  // The tool's diagnostics are expected on bad sources: silence them, but not the
  // fuzzer's own reports, which also go to standard error.
  std::fflush(stderr);
  int saved = dup(2), null = open("/dev/null", O_WRONLY);
  dup2(null, 2);
  cmdGencat(7, const_cast<char **>(argv));  // starts and ends the library itself
  std::fflush(stderr);
  dup2(saved, 2);
  close(saved);
  close(null);
  return 0;
}
