// Writes each harness's seed corpus from the generated definitions:
//   mkseeds DEFS_DIR OUT_DIR
// Object harnesses get a selector byte before a real file; text harnesses get samples.
#include <cstdio>
#include <string>
#include <vector>

#include "tools/tlx/catfile.h"

namespace {

std::vector<unsigned char> slurp(const std::string &path) {
  std::vector<unsigned char> data;
  if (FILE *f = std::fopen(path.c_str(), "rb")) {
    unsigned char buf[65536];
    for (size_t n; (n = std::fread(buf, 1, sizeof buf, f)) > 0;) data.insert(data.end(), buf, buf + n);
    std::fclose(f);
  }
  return data;
}

bool write(const std::string &path, const std::vector<unsigned char> &data) {
  FILE *f = std::fopen(path.c_str(), "wb");
  if (!f) return false;
  bool ok = std::fwrite(data.data(), 1, data.size(), f) == data.size();
  return std::fclose(f) == 0 && ok;
}

bool seed(const std::string &dir, const std::string &name, unsigned char selector, const std::string &file,
          const std::string &defs) {
  std::vector<unsigned char> data{selector};
  std::vector<unsigned char> body = slurp(defs + "/" + file);
  if (body.empty()) return false;
  data.insert(data.end(), body.begin(), body.end());
  return write(dir + "/" + name, data);
}

bool text(const std::string &dir, const std::string &name, std::initializer_list<unsigned char> head,
          const std::string &body) {
  std::vector<unsigned char> data(head);
  data.insert(data.end(), body.begin(), body.end());
  return write(dir + "/" + name, data);
}

}  // namespace

int main(int argc, char **argv) {
  if (argc != 3) {
    std::fprintf(stderr, "usage: mkseeds DEFS_DIR OUT_DIR\n");
    return 2;
  }
  std::string defs = argv[1], out = argv[2];
  bool ok = true;
  for (int i = 0; i < 4; ++i) ok &= seed(out + "/control", "control" + std::to_string(i), i, "control.nls", defs);
  ok &= seed(out + "/language", "german", 0, "la_00010.nls", defs);
  ok &= seed(out + "/language", "japanese", 1, "la_00016.nls", defs);
  ok &= seed(out + "/territory", "germany", 0, "te_00276.nls", defs);
  ok &= seed(out + "/territory", "japan", 1, "te_00392.nls", defs);
  const char *pages[] = {"cp_01252.nls", "cp_00932.nls", "cp_00954.nls", "cp_00930.nls", "cp_57352.nls", "cp_00037.nls"};
  for (int i = 0; i < 6; ++i) ok &= seed(out + "/codepage", pages[i], i, pages[i], defs);
  for (int i = 0; i < 3; ++i) ok &= seed(out + "/alias", "alias" + std::to_string(i), i, "alias.txt", defs);
  const char *names[] = {"German_Germany.MS1252", "de_DE.UTF-8", "Japanese_Japan.IBM930@Binary", "ja_JP.eucJP",
                         "C", "POSIX", "French", "fr_FR@euro", "English_UnitedStates.ISO-8859-1"};
  for (const char *n : names) ok &= text(out + "/locname", n, {}, n);
  const std::string samples[] = {"Gr\xC3\xBC\xC3\x9F" "e \xF0\x9F\x98\x80 a\xFF\xFE", "\x82\xA0\x82\xA2 abc \x93\xFA",
                                 "\x0E\x45\x41\x48\x67\x0F\xC1\x0E", "\xA4\xA2\xB0\xA1 \x8E\xB1"};
  for (unsigned char s = 0; s < 9; ++s)
    for (unsigned char t = 0; t < 9; t += 4)
      ok &= text(out + "/convert", "c" + std::to_string(s) + "_" + std::to_string(t), {s, t, 7, 1, 2, 3},
                 samples[s % 4]);
  for (unsigned char s = 0; s < 14; s += 3)
    ok &= text(out + "/translate", "t" + std::to_string(s), {0, s, 0x03, 40, 1}, samples[s % 4]);
  const char *sorts[] = {"so_00001.nls", "so_00002.nls", "so_00010.nls"};
  for (int i = 0; i < 3; ++i) ok &= seed(out + "/sort", sorts[i], i, sorts[i], defs);
  const std::string times[][2] = {{"%c", "Fri Dec 31 23:59:59 1999"}, {"%x %X", "12/31/99 23:59:59"},
                                  {"%A %d %B %Y %#I %p", "Friday 31 December 1999 11 PM"},
                                  {"%Y-%m-%d %H:%M:%S %j %%", "1999-12-31 23:59:59 364 %"}};
  for (unsigned char i = 0; i < 4; ++i)
    for (unsigned char loc = 0; loc < 4; ++loc)
      ok &= text(out + "/timetext", "t" + std::to_string(i) + "_" + std::to_string(loc),
                 {loc, static_cast<unsigned char>(times[i][0].size())}, times[i][0] + times[i][1]);
  const std::string numbers[] = {"-1.234.567", "  +0x7fffffff", "12,345.678e3", "4294967296", "1.234,56 \x80"};
  for (unsigned char i = 0; i < 5; ++i)
    ok &= text(out + "/number", "n" + std::to_string(i), {i, 10, 0x39, 0x30, 0x20, 0x10, 20}, numbers[i]);
  catfile::Catalog cat;
  cat.locale = "German_Germany.MS1252";
  cat.sets[1] = {{1, "Datei nicht gefunden"}, {2, "Gr\xFC\xDF" "e"}, {7, ""}};
  cat.sets[3] = {{1, "three"}, {100000, "far"}};
  std::string image = catfile::write(cat);
  for (unsigned char sel : {0, 1, 0x80, 0x82})
    ok &= text(out + "/catalog", "cat" + std::to_string(sel), {sel}, image);
  const std::string sources[] = {
      "$ a comment\n$set 1\n1 Hello\n2 Two \\\n  lines\n3\n$quote \"\n4 \"quoted\\t\\101\"\n",
      "$set 2\n$delset 2\n$set 3 comment\n10 ten\n5 five\n$set 1\n1 \x82\xA0\x82\xA2\n",
      "$set 1\n1 \x0E\x45\x41\x0F ab\n"};
  for (unsigned char sel = 0; sel < 4; ++sel)
    ok &= text(out + "/msgsource", "msg" + std::to_string(sel), {sel}, sources[sel % 3]);
  if (!ok) {
    std::fprintf(stderr, "mkseeds: could not write the seeds under %s\n", out.c_str());
    return 1;
  }
  return 0;
}
