// Locales on the generated definitions in MS1252, MS932 and IBM930, with the counting
// hooks; the suite is skipped when the build made no definitions.
#pragma once
#include <gtest/gtest.h>

#include <filesystem>
#include <memory>
#include <string>

#include "support/hooks.h"

namespace gents {

inline std::string B(const char *s, size_t n) { return std::string(s, n); }

class GenLocales : public ::testing::Test {
 protected:
  void SetUp() override {
    if (!std::filesystem::exists(std::string(VL_TEST_DEFS_DIR) + "/control.nls"))
      GTEST_SKIP() << "no generated definitions";
    lib_ = std::make_unique<ts::Library>(VL_TEST_DEFS_DIR, VL_OPT_NOBUILTIN);
    ASSERT_EQ(lib_->rc, 0u);
    for (auto [name, slot] : {std::pair{"English_UnitedStates.MS1252", &sb_}, {"Japanese_Japan.MS932", &mb_},
                              {"Japanese_Japan.IBM930", &sh_}, {"Turkish_Turkey.MS1254", &tr_},
                              {"German_Germany.MS1252", &de_}}) {
      uint32_t rc = 0;
      *slot = VLGetLocale(name, 0, &rc);
      ASSERT_NE(*slot, nullptr) << name << " rc " << rc;
    }
  }
  void TearDown() override {
    for (VLLocale *l : {sb_, mb_, sh_, tr_, de_})
      if (l) VLReleaseLocale(l);
    lib_.reset();
  }
  std::unique_ptr<ts::Library> lib_;

 public:  // cases name the locales by member pointer
  VLLocale *sb_ = nullptr, *mb_ = nullptr, *sh_ = nullptr, *tr_ = nullptr, *de_ = nullptr;
};

}  // namespace gents
