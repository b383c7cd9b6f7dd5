// Runtime frame: path pieces, file names, the file layer, initialisation counting, tracing.
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cstdlib>
#include <fstream>

#include "frame/frame.h"
#include "support/defdir.h"
#include "support/hooks.h"

namespace {

struct SplitCase {
  const char *path, *drive, *dir, *file, *ext;
};

TEST(Paths, SplitPieces) {
  const SplitCase cases[] = {
      {"/a/control.nls", "", "/a/", "control", ".nls"},
      {"c:/x/y.txt", "c:", "/x/", "y", ".txt"},
      {"/a/abcdefghijklmno.txt", "", "/a/", "", ".txt"},  // base of 15 is too long
      {"name.longext", "", "", "name", ""},               // extension over 4 with its dot
      {"/a/b/..", "", "/a/b/..", "", ""},
      {"/a/.", "", "/a/.", "", ""},
      {"abcd:/x", "", "abcd:/", "x", ""},  // a colon too far in is no drive
      {"plain", "", "", "plain", ""},
  };
  for (const auto &c : cases) {
    char drive[4], dir[256], file[15], ext[5];
    SplitPath(c.path, drive, dir, file, ext);
    EXPECT_STREQ(drive, c.drive) << c.path;
    EXPECT_STREQ(dir, c.dir) << c.path;
    EXPECT_STREQ(file, c.file) << c.path;
    EXPECT_STREQ(ext, c.ext) << c.path;
  }
  char out[64];
  EXPECT_STREQ(MakePath(out, "c:", "/x/", "y", ".txt"), "c:/x/y.txt");
  EXPECT_STREQ(MakePath(out, "", "/x/", "y", ""), "/x/y");
}

TEST(Paths, DefinitionFileNames) {
  char buf[64];
  ASSERT_NE(VLGetDataFileName("/d", 2, 37, buf, sizeof buf), nullptr);
  EXPECT_STREQ(buf, "/d/cp_00037.nls");
  EXPECT_STREQ(VLGetDataFileName("/Tavrel/locale", 2, 850, buf, sizeof buf), "/Tavrel/locale/cp_00850.nls");
  EXPECT_EQ(VLGetDataFileName("/d", 2, 37, buf, 15), nullptr);  // "/d" + 14 does not fit 15
  EXPECT_NE(VLGetDataFileName("/d", 2, 37, buf, 16), nullptr);
  EXPECT_STREQ(VLGetControlFileName("/x", buf, sizeof buf), "/x/control.nls");
  EXPECT_EQ(VLGetControlFileName("/x", buf, 14), nullptr);
  EXPECT_NE(VLGetControlFileName("/x", buf, 15), nullptr);
  std::string dir246(246, 'd'), dir247(247, 'd');
  char big[256];
  EXPECT_NE(VLGetAliasFileName(dir246.c_str(), big, sizeof big), nullptr);
  EXPECT_EQ(VLGetAliasFileName(dir247.c_str(), big, sizeof big), nullptr);
}

TEST(Paths, DataLocation) {
  char buf[256];
  unsetenv("VL_LOCALEDIR");
  EXPECT_EQ(VLGetDataLocation(buf, sizeof buf, 0), -1);
  setenv("VL_LOCALEDIR", std::string(300, 'x').c_str(), 1);
  EXPECT_EQ(VLGetDataLocation(buf, sizeof buf, 0), 0);
  setenv("VL_LOCALEDIR", "/some/where", 1);
  EXPECT_EQ(VLGetDataLocation(buf, sizeof buf, 0), 12);
  EXPECT_STREQ(buf, "/some/where");
  unsetenv("VL_LOCALEDIR");
  EXPECT_EQ(VLGetDataLocation(buf, 17, 1), 17);
  EXPECT_STREQ(buf, "/Tavrel/locale");
  EXPECT_EQ(VLGetDataLocation(buf, 16, 1), 0);
  EXPECT_EQ(VLmemicmp("Latin1", "LATIN1", 6), 0);
  EXPECT_LT(VLmemicmp("a", "B", 1), 0);
}

TEST(Files, TemporaryReplacementAndDiscard) {
  ts::TempDir d;
  // A directory part past 255 characters, made of names the file system takes.
  std::string deep = d.path;
  while (deep.size() <= 300) {
    deep += "/" + std::string(60, 'd');
    ASSERT_EQ(mkdir(deep.c_str(), 0755), 0);
  }
  struct Case {
    const char *what;
    std::string file, temp;  // the named file and the temporary beside it
  } cases[] = {
      {"short name", d.file("x.nls"), d.file("xtmp")},
      {"base name of 20 characters", d.file("abcdefghijklmnopqrst.nls"), d.file("abcdefghijklmnopqrsttmp")},
      {"no extension", d.file("plain"), d.file("plaintmp")},
      {"directory past 255 characters", deep + "/x.nls", deep + "/xtmp"},
  };
  for (const Case &c : cases) {
    std::ofstream(c.file) << "old";
    uint32_t rc = 99;
    for (int discard : {1, 0}) {
      VLFile *f = VLOpenFile(1, c.file.c_str(), VL_FILE_WRITE, 0, &rc);
      ASSERT_NE(f, nullptr) << c.what;
      EXPECT_EQ(rc, 0u);
      char b[4];
      EXPECT_EQ(VLReadFile(f, b, 1, &rc), 0);
      EXPECT_EQ(rc, VL_RC_FILE_WRITEONLY);
      ASSERT_EQ(write(f->descriptor, "new", 3), 3);
      // The named file is intact until the close.
      EXPECT_EQ(ts::readFile(c.file).size(), 3u) << c.what;
      struct stat st;
      EXPECT_EQ(stat(c.temp.c_str(), &st), 0) << c.what;
      EXPECT_EQ(VLCloseFile(f, discard), 0);
      EXPECT_NE(stat(c.temp.c_str(), &st), 0) << c.what;
      ts::Bytes bytes = ts::readFile(c.file);
      std::string got(bytes.begin(), bytes.end());
      EXPECT_EQ(got, discard ? "old" : "new") << c.what;
    }
  }
  // Nothing was left in the current directory.
  struct stat st;
  EXPECT_NE(stat("xtmp", &st), 0);
  uint32_t rc = 0;
  EXPECT_EQ(VLOpenFile(1, d.file("missing").c_str(), VL_FILE_READ, 0, &rc), nullptr);
  EXPECT_EQ(rc, VL_RC_FILE_MISSING);
}

TEST(Files, LoadSections) {
  ts::TempDir d;
  std::string p = d.file("f");
  std::ofstream(p) << "0123456789";
  uint32_t rc = 0;
  VLFile *f = VLOpenFile(1, p.c_str(), VL_FILE_READ, 0, &rc);
  ASSERT_NE(f, nullptr);
  EXPECT_EQ(VLFileSize(f), 10);
  EXPECT_EQ(VLLoadFile(f, 0, 0, &rc), nullptr);
  EXPECT_EQ(rc, 0u);
  void *b = VLLoadFile(f, 4, 6, &rc);
  ASSERT_NE(b, nullptr);
  EXPECT_EQ(std::memcmp(b, "456789", 6), 0);
  VLUnloadFile(b);
  EXPECT_EQ(VLLoadFile(f, 5, 6, &rc), nullptr);  // runs past the end
  EXPECT_EQ(rc, VL_RC_FILE_IO);
  EXPECT_EQ(VLCloseFile(f, 0), 0);
}

TEST(Init, CountedAndFirstCallWins) {
  ts::TempDir empty;
  unsetenv("VL_LOCALEDIR");
  ts::resetHooks();
  EXPECT_EQ(VLInit(empty.path.c_str(), ts::countingAlloc, ts::countingFree, 3, 0), VL_RC_DEFAULTS);
  long before = ts::hooks.allocs;
  // Later calls only count: other hooks and another directory change nothing.
  EXPECT_EQ(VLInit("/elsewhere", VLDefAlloc, VLDefFree, 0, 0), VL_RC_OK);
  EXPECT_EQ(vlglobals->initCount, 2);
  EXPECT_EQ(VLTerm(), 0u);
  ASSERT_NE(vlglobals, nullptr);
  uint32_t rc;
  VLLocale *l = VLGetLocale("", 0, &rc);
  ASSERT_NE(l, nullptr);
  EXPECT_GT(ts::hooks.allocs, before);  // still the first call's hooks
  EXPECT_STREQ(l->codePage->name, "US-ASCII");  // the built-in locale
  EXPECT_EQ(VLReleaseLocale(l), 0u);
  EXPECT_EQ(VLTerm(), 0u);
  EXPECT_EQ(vlglobals, nullptr);
  EXPECT_EQ(ts::hooks.live, 0);
}

TEST(Trace, WritesLinesAndNeverChangesResults) {
  ts::TempDir d;
  std::string log = d.file("trace.log");
  auto run = [&] {
    ts::Library lib(d.path.c_str());
    uint32_t rc = 0;
    VLLocale *l = VLGetLocale("Nowhere", VL_LOCALE_FALLBACK, &rc);
    std::string got = l ? std::string(l->language->name) + "/" + std::to_string(rc) : "none";
    VLReleaseLocale(l);
    return std::to_string(lib.rc) + got;
  };
  std::string plain = run();
  TRC1_Configure("0xFF", log.c_str());
  std::string traced = run();
  TRC1_Configure("0", "");
  EXPECT_EQ(plain, traced);
  std::ifstream in(log);
  std::string all((std::istreambuf_iterator<char>(in)), {});
  EXPECT_NE(all.find("Veltrin vlinit: Creating global area"), std::string::npos);
  EXPECT_NE(all.find("Unable to open control file"), std::string::npos);
  EXPECT_NE(all.find("> VLGetLocale"), std::string::npos);
}

}  // namespace
