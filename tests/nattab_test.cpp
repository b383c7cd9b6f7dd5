// The native locale table: the rules its rows keep among themselves.
#include <gtest/gtest.h>

#include <map>
#include <set>
#include <span>
#include <string>

#include "locale/native.h"

namespace {

std::string prefix(const std::string &native) { return native.substr(0, native.find_first_of(".@")); }

TEST(NativeTable, RowsAreUniqueAndConsistent) {
  std::set<std::string> natives;
  std::map<std::string, std::string> langOfPrefix, terrOfPrefix, langCodeOf;
  for (const vl::nat::Row &r : std::span(vl::nat::kRows, vl::nat::kRowCount)) {
    std::string n = r.native;
    EXPECT_TRUE(natives.insert(n).second) << n;
    for (const char *col : {r.language, r.territory, r.codePage, r.sort})
      EXPECT_EQ(std::string(col).find(' '), std::string::npos) << n;
    bool unicode = n.find(".utf8") != std::string::npos || n.find("@euro") != std::string::npos;
    EXPECT_EQ(unicode, std::string(r.codePage) == "UTF-8") << n;
    // Every form of one native locale names the same language and territory.
    auto [l, lnew] = langOfPrefix.emplace(prefix(n), r.language);
    auto [t, tnew] = terrOfPrefix.emplace(prefix(n), r.territory);
    EXPECT_EQ(l->second, r.language) << n;
    EXPECT_EQ(t->second, r.territory) << n;
    // One language name stands for one language code.
    if (n != "C" && n != "POSIX" && n.substr(0, 2) != "zh") {
      auto [c, cnew] = langCodeOf.emplace(r.language, n.substr(0, 2));
      EXPECT_EQ(c->second, n.substr(0, 2)) << n;
    }
  }
}

}  // namespace
