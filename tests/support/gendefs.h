// What tests on the generated definitions share: a library with the counting hooks and
// the handles a test opened, text in a code page through iconv, environment variables set
// for one scope, and platform locales built with localedef as oracles.
#pragma once
#include <gtest/gtest.h>
#include <iconv.h>

#include <cstdlib>
#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "support/hooks.h"
#include "veltrin.h"

namespace ts {

inline bool haveDefs() { return std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"); }

inline std::string iconvTo(const std::string &in, const char *to, const char *from = "UTF-8") {
  iconv_t cd = iconv_open(to, from);
  if (cd == reinterpret_cast<iconv_t>(-1)) return "<no iconv>";
  std::string src = in, out(in.size() * 4 + 16, '\0');
  char *ip = src.data(), *op = out.data();
  size_t il = src.size(), ol = out.size();
  iconv(cd, &ip, &il, &op, &ol);
  iconv(cd, nullptr, nullptr, &op, &ol);
  iconv_close(cd);
  out.resize(out.size() - ol);
  return out;
}

// Sets (or with null unsets) a variable for one scope.
struct EnvScope {
  std::string name, old;
  bool had;
  EnvScope(const char *n, const char *v) : name(n) {
    const char *o = std::getenv(n);
    had = o != nullptr;
    if (o) old = o;
    if (v)
      setenv(n, v, 1);
    else
      unsetenv(n);
  }
  ~EnvScope() {
    if (had)
      setenv(name.c_str(), old.c_str(), 1);
    else
      unsetenv(name.c_str());
  }
  EnvScope(const EnvScope &) = delete;
  EnvScope &operator=(const EnvScope &) = delete;
};

// Compiles the platform locale `source` in `charset` into `out` (a LOCPATH entry).
inline bool localedef(const std::string &source, const std::string &charset, const std::string &out) {
  const std::string cmd = "localedef -c -i " + source + " -f " + charset + " " + out + " >/dev/null 2>&1";
  return std::system(cmd.c_str()) == 0 || std::filesystem::exists(out + "/LC_TIME");
}

class DefsTest : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!haveDefs()) GTEST_SKIP() << "no generated definitions";
    lib_ = std::make_unique<Library>(VL_TEST_DEFS_DIR);
    ASSERT_EQ(lib_->rc, 0u);
  }
  void TearDown() override {
    for (VLLocale *l : open_) VLReleaseLocale(l);
    if (!lib_) return;
    lib_.reset();
    EXPECT_EQ(hooks.live, 0);
  }
  VLLocale *loc(const std::string &name) {
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name.c_str(), 0, &rc);
    EXPECT_NE(l, nullptr) << name << " rc " << rc;
    if (l) open_.push_back(l);
    return l;
  }
  std::unique_ptr<Library> lib_;
  std::vector<VLLocale *> open_;
};

}  // namespace ts
