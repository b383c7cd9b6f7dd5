// What the time tests share: a library on the generated definitions with the handles a
// test opened, and text in a code page through iconv (with its shift bytes for IBM930).
#pragma once
#include <gtest/gtest.h>
#include <iconv.h>

#include <filesystem>
#include <memory>
#include <string>
#include <vector>

#include "support/hooks.h"
#include "veltrin.h"

namespace ts {

inline std::string iconvTo(const std::string &utf8, const char *to) {
  iconv_t cd = iconv_open(to, "UTF-8");
  if (cd == reinterpret_cast<iconv_t>(-1)) return "<no iconv>";
  std::string in = utf8, out(utf8.size() * 4 + 8, '\0');
  char *ip = in.data(), *op = out.data();
  size_t il = in.size(), ol = out.size();
  iconv(cd, &ip, &il, &op, &ol);
  iconv(cd, nullptr, nullptr, &op, &ol);
  iconv_close(cd);
  out.resize(out.size() - ol);
  return out;
}

class TimeTest : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"))
      GTEST_SKIP() << "no generated definitions";
    lib_ = std::make_unique<Library>(VL_TEST_DEFS_DIR);
    ASSERT_EQ(lib_->rc, 0u);
  }
  void TearDown() override {
    for (VLLocale *l : open_) VLReleaseLocale(l);
    if (!lib_) return;
    lib_.reset();
    EXPECT_EQ(hooks.live, 0);
  }
  VLLocale *loc(const char *name) {
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale(name, 0, &rc);
    EXPECT_NE(l, nullptr) << name << " rc " << rc;
    if (l) open_.push_back(l);
    return l;
  }
  std::unique_ptr<Library> lib_;
  std::vector<VLLocale *> open_;
};

}  // namespace ts
