// mkdefs --out DIR [--report FILE] [--unicode DIR] [--locale-src DIR]
// Writes the locale definitions directory: one object file per code page (from the C
// library's iconv), language and territory, control.nls, alias.txt, and a report of what
// the code pages could not hold as iconv has it.
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <map>
#include <set>
#include <sstream>
#include <string>

#include "container.h"
#include "cpbuild.h"
#include "cpread.h"
#include "iconvcp.h"
#include "locales.h"
#include "sortbuild.h"
#include "ucd.h"

namespace {

using namespace mkdefs;

constexpr uint16_t kUtf8 = 57352;

std::string hex(const std::string &bytes) {
  std::string s;
  char b[4];
  for (unsigned char c : bytes) {
    std::snprintf(b, sizeof b, "%02X", c);
    s += b;
  }
  return s;
}
std::string unit(uint32_t u) {
  char b[12];
  std::snprintf(b, sizeof b, "U+%04X", u);
  return b;
}
std::string wBytes(uint32_t w) {
  std::string s;
  for (int sh = 24; sh >= 0; sh -= 8)
    if ((w >> sh) || sh == 0 || !s.empty()) s += static_cast<char>(w >> sh & 0xFF);
  return s;
}
uint32_t packW(const std::string &s) {
  uint32_t w = 0;
  for (unsigned char c : s) w = w << 8 | c;
  return w;
}

// Reads every mapping back out of the built sections; each disagreement is a line.
std::vector<std::string> selfCheck(const CpSource &src, const CpSections &cp, const UnicodeProps &ucd) {
  std::vector<std::string> bad;
  const CpReader r(cp);
  const bool utf8 = src.id == kUtf8;
  const bool types = r.offset(4370) != 0;
  try {
    for (const auto &[s, u] : src.toUni) {
      const bool single = s.size() == 1;
      if (single) {
        const uint8_t b = static_cast<uint8_t>(s[0]);
        if (r.singleToUnicode(b) != u) bad.push_back("decode " + hex(s) + " gives " + unit(r.singleToUnicode(b)));
        if (r.singleType(b) != ucd.typeWord[u]) bad.push_back("single-byte type of " + hex(s));
      } else if (!utf8 && r.toUnicode(s) != u) {
        bad.push_back("decode " + hex(s) + " gives " + unit(r.toUnicode(s)));
      }
      if (!types || single) continue;  // one-byte characters have no type record
      const CpReader::Type t = r.type(s);
      if (t.type != ucd.typeWord[u]) bad.push_back("type of " + hex(s));
      if (t.delta) {
        const std::string other = wBytes(packW(s) + static_cast<uint32_t>(t.delta));
        const uint16_t o = other.size() == 1 ? r.singleToUnicode(static_cast<uint8_t>(other[0]))
                           : utf8            ? src.toUni.count(other) ? src.toUni.at(other) : 0xFFFD
                                             : r.toUnicode(other);
        if (o != ucd.upper[u] && o != ucd.lower[u]) bad.push_back("case delta of " + hex(s));
      }
    }
    for (const auto &[u, s] : src.fromUni) {
      if (utf8 && u >= 0x80) continue;  // the library converts UTF-8 by arithmetic
      if (r.fromUnicode(u) != packW(s)) bad.push_back("encode " + unit(u) + " gives " + hex(wBytes(r.fromUnicode(u))));
    }
  } catch (const std::exception &e) {
    bad.push_back(std::string("reading the object failed: ") + e.what());
  }
  return bad;
}

void reportPage(std::ostream &rep, const CodePageDef &def, const Extracted &x, const CpSections &cp,
                const std::vector<std::string> &bad) {
  const CpSource &s = x.src;
  size_t singles = 0, multis = 0, roundTrips = 0;
  std::vector<std::string> decodeOnly, encodeOnly;
  for (const auto &[bytes, u] : s.toUni) {
    (bytes.size() == 1 ? singles : multis)++;
    auto f = s.fromUni.find(u);
    if (f == s.fromUni.end())
      decodeOnly.push_back(hex(bytes) + " -> " + unit(u) + " (" + unit(u) + " does not encode)");
    else if (f->second != bytes)
      decodeOnly.push_back(hex(bytes) + " -> " + unit(u) + " (" + unit(u) + " -> " + hex(f->second) + ")");
    else
      ++roundTrips;
  }
  for (const auto &[u, bytes] : s.fromUni) {
    auto t = s.toUni.find(bytes);
    if (t == s.toUni.end())
      encodeOnly.push_back(unit(u) + " -> " + hex(bytes) + " (" + hex(bytes) + " does not decode)");
    else if (t->second != u)
      encodeOnly.push_back(unit(u) + " -> " + hex(bytes) + " (" + hex(bytes) + " -> " + unit(t->second) + ")");
  }
  rep << "== " << def.name << " (code page " << def.id << ", iconv " << def.iconvName << ")\n";
  rep << "characters: " << singles << " single-byte, " << multis << " longer; units encoded: " << s.fromUni.size()
      << "; round trips: " << roundTrips << "\n";
  rep << "sections: body " << cp.sections[0].size() << ", conversion trie " << cp.sections[1].size() << ", low table "
      << cp.sections[2].size() << ", high table " << cp.sections[3].size() << " bytes\n";
  if (x.outsideBmp || x.severalUnits || x.lengthConflicts || x.severalChars)
    rep << "left out: " << x.outsideBmp << " sequences beyond the BMP, " << x.severalUnits
        << " sequences decoding to several characters, " << x.lengthConflicts
        << " sequences of another length than their lead byte's, " << x.severalChars
        << " units encoding to several characters\n";
  if (!cp.note.empty()) rep << "note: " << cp.note << "\n";
  if (!x.droppedGroups.empty()) {
    rep << "left out to fit the conversion trie: " << x.droppedChars << " characters of the sequences starting";
    for (const std::string &g : x.droppedGroups) rep << ' ' << hex(g);
    rep << " (their units still encode as iconv has them)\n";
  }
  for (const std::string &n : x.notes) rep << "note: " << n << "\n";
  rep << "one-way decodes: " << decodeOnly.size() << "\n";
  for (const std::string &l : decodeOnly) rep << "  " << l << "\n";
  rep << "one-way encodes: " << encodeOnly.size() << "\n";
  for (const std::string &l : encodeOnly) rep << "  " << l << "\n";
  rep << "differences between the object and iconv: " << bad.size() << "\n";
  for (const std::string &l : bad) rep << "  " << l << "\n";
  rep << "\n";
}

std::string upper(std::string s) {
  for (char &c : s) c = static_cast<char>(std::toupper(static_cast<unsigned char>(c)));
  return s;
}

bool aliasFile(const std::string &path, std::string *err) {
  std::ostringstream a;
  a << "# Code page aliases. A line starting in column 1 names a code page as the control\n"
       "# file does, followed by other names for it; an indented line adds more names.\n";
  std::set<std::string> taken;
  for (const CodePageDef &p : codeCodePageDefs()) taken.insert(upper(p.name));
  for (const CodePageDef &p : codeCodePageDefs()) {
    a << p.name;
    for (const std::string &al : p.aliases) {
      if (al.size() > 64 || !taken.insert(upper(al)).second) {
        *err = "alias " + al + " of " + p.name + " is too long or names another code page";
        return false;
      }
      a << ' ' << al;
    }
    a << '\n';
  }
  const std::string text = a.str();
  return writeFile(path, Bytes(text.begin(), text.end()), err);
}

int fail(const std::string &msg) {
  std::fprintf(stderr, "mkdefs: %s\n", msg.c_str());
  return 1;
}

}  // namespace

int main(int argc, char **argv) {
  std::string outDir, reportPath, ucdDir = "/usr/share/unicode", localeSrc = "/usr/share/i18n/locales";
  for (int i = 1; i < argc; ++i) {
    const std::string a = argv[i];
    auto value = [&](std::string *into) {
      if (i + 1 >= argc) return false;
      *into = argv[++i];
      return true;
    };
    bool ok = (a == "--out" && value(&outDir)) || (a == "--report" && value(&reportPath)) ||
              (a == "--unicode" && value(&ucdDir)) || (a == "--locale-src" && value(&localeSrc));
    if (!ok) return fail("usage: mkdefs --out DIR [--report FILE] [--unicode DIR] [--locale-src DIR]");
  }
  if (outDir.empty()) return fail("usage: mkdefs --out DIR [--report FILE] [--unicode DIR] [--locale-src DIR]");
  if (reportPath.empty()) reportPath = outDir + "/report.txt";
  std::error_code ec;
  std::filesystem::create_directories(outDir, ec);
  if (ec) return fail("cannot create " + outDir + ": " + ec.message());

  std::string err;
  UnicodeProps ucd;
  if (!loadUnicode(ucdDir, &ucd, &err)) return fail(err);

  std::vector<ControlRow> rows;
  std::ostringstream rep;
  rep << "Code pages as extracted from iconv. A one-way decode is a byte sequence whose\n"
         "character encodes to other bytes; a one-way encode is a unit whose bytes decode to\n"
         "another character (or none). The objects reproduce both directions as iconv has them.\n\n";
  size_t totalBad = 0;
  for (const CodePageDef &def : codeCodePageDefs()) {
    Extracted x;
    CpSections cp;
    Bytes file;
    if (!extractCodePage(def, &x, &err) || !buildFitted(&x, ucd, &cp, &err) ||
        !containerFile(cp.sections, 2, &file, &err) ||
        !writeFile(outDir + "/" + objectFileName(2, def.id), file, &err))
      return fail(err);
    const std::vector<std::string> bad = selfCheck(x.src, cp, ucd);
    totalBad += bad.size();
    reportPage(rep, def, x, cp, bad);
    rows.push_back(ControlRow{def.id, 2, def.name});
  }

  auto codePageId = [](const std::string &name) -> uint16_t {
    for (const CodePageDef &p : codeCodePageDefs()) {
      if (upper(p.name) == upper(name)) return p.id;
      for (const std::string &a : p.aliases)
        if (upper(a) == upper(name)) return p.id;
    }
    return 0;
  };
  std::vector<SortObject> sorts;
  if (!buildSorts(localeSrc, &sorts, &err)) return fail(err);
  std::map<std::string, uint16_t> sortIds;
  for (const SortObject &so : sorts) {
    Bytes body, file;
    if (!so.body.bytes(&body, &err) || !containerFile({body}, 2, &file, &err) ||
        !writeFile(outDir + "/" + objectFileName(3, so.id), file, &err))
      return fail(so.name + ": " + err);
    rows.push_back(ControlRow{so.id, 3, so.name});
    sortIds[so.name] = so.id;
    rep << so.report;
  }

  SpecialCasing special;
  if (!readSpecialCasing(ucdDir, &special, &err)) return fail(err);
  const Casing casing{special, ucd};
  std::vector<std::string> casingReport;
  std::vector<DefObject> objects;
  if (buildLanguagesAndTerritories(localeSrc, codePageId, &objects, &err, &casing, &casingReport)) {
    rep << "\nLanguage special casing (tables 44 upper, 45 lower) and what it cannot carry:\n";
    for (const std::string &line : casingReport) rep << line << "\n";
    for (DefObject &o : objects) {
      // A language's default sort (body word 2): the one its native rows name.
      auto sid = sortIds.find(sortOfLanguage(o.name));
      if (o.type == 0 && sid != sortIds.end() && o.sections.size() == 1 && o.sections[0].size() > 5)
        set16(o.sections[0], 4, sid->second);
      Bytes file;
      if (!containerFile(o.sections, 2, &file, &err) ||
          !writeFile(outDir + "/" + objectFileName(o.type, o.id), file, &err))
        return fail(o.name + ": " + err);
      rows.push_back(ControlRow{o.id, o.type, o.name});
    }
  } else {
    rep << "languages and territories not written: " << err << "\n";
  }

  Bytes control;
  if (!controlFile(rows, &control, &err) || !writeFile(outDir + "/control.nls", control, &err) ||
      !aliasFile(outDir + "/alias.txt", &err))
    return fail(err);
  const std::string text = rep.str();
  if (!writeFile(reportPath, Bytes(text.begin(), text.end()), &err)) return fail(err);
  if (totalBad) return fail(std::to_string(totalBad) + " differences between the objects and iconv; see " + reportPath);
  return 0;
}
