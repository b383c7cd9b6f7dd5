// The shared library exports every public name and nothing else.
#include <dlfcn.h>
#include <gtest/gtest.h>

#include <cstdio>
#include <filesystem>
#include <vector>
#include <fstream>
#include <regex>
#include <set>
#include <string>

namespace {

// Every name the public headers declare with VL_API.
std::set<std::string> publicNames() {
  std::set<std::string> names;
  std::vector<std::filesystem::path> headers = {VL_SOURCE_DIR "/include/veltrin.h", VL_SOURCE_DIR "/include/nls1.h"};
  for (auto &e : std::filesystem::directory_iterator(VL_SOURCE_DIR "/include/veltrin")) headers.push_back(e.path());
  // A declaration starts a line with VL_API and names itself before its first '(', ';' or '['.
  const std::regex decl(R"(^VL_API\s+[^;(\[]*?\b([A-Za-z_][A-Za-z0-9_]*)\s*[;(\[])");
  for (auto &h : headers) {
    std::ifstream in(h);
    std::string text((std::istreambuf_iterator<char>(in)), {});
    for (size_t at = text.find("VL_API "); at != std::string::npos; at = text.find("VL_API ", at + 1)) {
      if (at > 0 && text[at - 1] != '\n') continue;
      std::smatch m;
      std::string stmt = text.substr(at, text.find(';', at) - at + 1);
      if (std::regex_search(stmt, m, decl)) names.insert(m[1]);
    }
  }
  return names;
}

TEST(Exports, EveryPublicNameResolves) {
  void *lib = dlopen(VL_TEST_LIBTLX, RTLD_NOW | RTLD_LOCAL);
  ASSERT_NE(lib, nullptr) << dlerror();
  for (const std::string &n : publicNames()) EXPECT_NE(dlsym(lib, n.c_str()), nullptr) << n;
  dlclose(lib);
}

TEST(Exports, NothingElseIsVisible) {
  std::string cmd = "nm -D --defined-only " VL_TEST_LIBTLX;
  FILE *p = popen(cmd.c_str(), "r");
  ASSERT_NE(p, nullptr);
  const std::regex ours("^(VL|vl|NLS1_|MC|Split|MakePath|AdjustLength)");
  std::set<std::string> names = publicNames();
  char line[512];
  int count = 0;
  while (fgets(line, sizeof line, p)) {
    std::string s(line);
    std::string name = s.substr(s.rfind(' ') + 1);
    name.erase(name.find_last_not_of("\n") + 1);
    char kind = s.size() > 17 ? s[17] : ' ';
    if (kind == 'A' || kind == 'W' || kind == 'V' || kind == 'u' || name.rfind("_", 0) == 0) continue;
    ++count;
    EXPECT_TRUE(std::regex_search(name, ours)) << "unexpected export " << name;
    EXPECT_TRUE(names.count(name)) << name << " is exported but no public header declares it";
  }
  pclose(p);
  EXPECT_GT(count, 50);
}

}  // namespace
