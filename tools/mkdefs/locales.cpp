// Language and territory objects for every language and territory of the native locale
// table, filled from the C library's locale sources.
//
// Numbering: English is language 1, the languages of the first table follow from 2 in
// ascending (byte-wise) order of their names, and languages added since take the next
// numbers in the order they were added; territories carry their ISO 3166 numeric code.
// A language is read from its primary row: the first row whose territory code repeats
// the language code ("de_DE" rather than "de_AT"), else its first row in a territory
// whose own first row is of that language ("sv_SE" rather than "sv_FI"), else its first
// row. A territory is read from the first row that names it, rows of the languages added
// later counting only when no other row names it.
#include "locales.h"

#include <algorithm>
#include <filesystem>
#include <map>
#include <set>

#include "locsrc_parse.h"
#include "locsrc_pattern.h"
#include "specialcase.h"

namespace mkdefs {
namespace {

using locsrc::Values;

struct NativeRow {
  const char *native, *language, *territory, *codePage, *sort;
};
const NativeRow kRows[] = {
#include "locale/nattab.inc"
};

// Native names the sources no longer carry under that name.
const std::map<std::string, std::string> kSourceAlias = {
    {"C", "en_US"},          {"POSIX", "en_US"},          {"iw_IL", "he_IL"},
    {"no_NO", "nb_NO"},      {"sh_YU", "sr_RS@latin"},    {"sr_YU", "sr_RS@latin"},
    {"sr_YU@cyril", "sr_RS"},
};

// Objects whose identity the sources do not hold (they are read from a successor locale).
struct Identity {
  const char *code;
  const char32_t *display;
  uint16_t number;
};
const std::map<std::string, Identity> kIdentity = {
    {"SerboCroatian", {"sh", U"Serbo-Croatian", 0}},
    {"Yugoslavia", {"YU", U"Yugoslavia", 891}},
};

// Languages added after the first numbering, oldest first. Ids once given never move, so
// a new language goes at the end of this list, never into the alphabetical run.
const char *const kLaterLanguages[] = {"Lithuanian", "Estonian", "Latvian", "Ukrainian", "Catalan"};

size_t addedRank(const std::string &language) {
  for (size_t i = 0; i < std::size(kLaterLanguages); ++i)
    if (language == kLaterLanguages[i]) return i + 1;
  return 0;
}

const size_t kLanguageWords = 52;   // 0-48, the two special-case table offsets, the special-casing flag
const size_t kTerritoryWords = 22;

std::string sourceFor(const std::string &native) {
  std::string name = native;
  size_t dot = name.find('.');
  if (dot != std::string::npos) name.erase(dot, name.find('@', dot) - dot);
  auto it = kSourceAlias.find(name);
  if (it != kSourceAlias.end()) return it->second;
  size_t at = name.find('@');
  if (at != std::string::npos) name.erase(at);
  it = kSourceAlias.find(name);
  return it != kSourceAlias.end() ? it->second : name;
}

// "de_DE.utf8" -> "de_DE"
std::string prefixOf(const std::string &native) { return native.substr(0, native.find_first_of(".@")); }

bool codesMatch(const std::string &native) {
  std::string p = prefixOf(native);
  size_t us = p.find('_');
  if (us == std::string::npos) return false;
  std::string lang = p.substr(0, us), terr = p.substr(us + 1);
  std::transform(lang.begin(), lang.end(), lang.begin(), [](char c) { return c - 'a' + 'A'; });
  return lang == terr;
}

// Lays out a body: fixed words first, then NUL-terminated UTF-16 texts, all big-endian.
class Body {
 public:
  explicit Body(size_t words) : bytes_(words * 2, 0) {}
  void word(size_t w, uint16_t v) {
    bytes_[w * 2] = static_cast<uint8_t>(v >> 8);
    bytes_[w * 2 + 1] = static_cast<uint8_t>(v);
  }
  void text(size_t w, const std::u32string &s) {
    std::u16string u = locsrc::toUtf16(s);
    auto it = offsets_.find(u);
    size_t at = it != offsets_.end() ? it->second : bytes_.size();
    if (it == offsets_.end()) {
      offsets_[u] = at;
      for (char16_t c : u) {
        bytes_.push_back(static_cast<uint8_t>(c >> 8));
        bytes_.push_back(static_cast<uint8_t>(c));
      }
      bytes_.push_back(0);
      bytes_.push_back(0);
    }
    word(w, static_cast<uint16_t>(at < 0x10000 ? at : 0));
    tooBig_ = tooBig_ || at >= 0x10000;
  }
  // Appends a special-case table and points word w at it.
  void table(size_t w, const std::vector<SpecialEntry> &t) {
    word(w, static_cast<uint16_t>(bytes_.size() < 0x10000 ? bytes_.size() : 0));
    tooBig_ = tooBig_ || bytes_.size() >= 0x10000;
    for (const SpecialEntry &e : t)
      for (uint16_t v : {e.key1, e.key2, e.res1, e.res2}) {
        bytes_.push_back(static_cast<uint8_t>(v >> 8));
        bytes_.push_back(static_cast<uint8_t>(v));
      }
  }
  bool finish(const std::string &what, Bytes *out, std::string *err) {
    if (tooBig_ || bytes_.size() > 65535) {
      *err = what + ": body exceeds 65,535 bytes";
      return false;
    }
    *out = std::move(bytes_);
    return true;
  }

 private:
  Bytes bytes_;
  std::map<std::u16string, size_t> offsets_;
  bool tooBig_ = false;
};

// Keyword lookups in one locale; the first failure is kept and later lookups give defaults.
class Fetch {
 public:
  Fetch(locsrc::SourceSet &set, std::string locale, std::string *err)
      : set_(set), locale_(std::move(locale)), err_(err) {}
  bool ok() const { return ok_; }

  const Values *values(const char *cat, const char *key, size_t count, bool optional = false) {
    std::string ferr;
    const Values *v = set_.find(locale_, cat, key, &ferr);
    if (v != nullptr && (count == 0 ? !v->empty() : v->size() == count)) return v;
    if (optional && v == nullptr && ferr.empty()) return nullptr;
    fail(!ferr.empty() ? ferr
                       : locale_ + ": " + cat + " " + key +
                             (v == nullptr ? " missing" : " has the wrong number of operands"));
    return nullptr;
  }
  std::u32string text(const char *cat, const char *key, bool optional = false) {
    const Values *v = values(cat, key, 1, optional);
    return v != nullptr ? (*v)[0].text : std::u32string();
  }
  int number(const char *cat, const char *key) {
    const Values *v = values(cat, key, 1);
    int n = 0;
    if (v != nullptr && !toInt((*v)[0].text, &n)) fail(locale_ + ": " + cat + " " + key + " is not a number");
    return n;
  }
  void fail(const std::string &msg) {
    if (ok_) *err_ = msg;
    ok_ = false;
  }
  static bool toInt(const std::u32string &s, int *out) {
    size_t i = s.size() > 1 && s[0] == U'-' ? 1 : 0;
    if (i == s.size() || s.size() > 9) return false;
    int v = 0;
    for (size_t k = i; k < s.size(); ++k) {
      if (s[k] < U'0' || s[k] > U'9') return false;
      v = v * 10 + static_cast<int>(s[k] - U'0');
    }
    *out = i ? -v : v;
    return true;
  }

 private:
  locsrc::SourceSet &set_;
  std::string locale_;
  std::string *err_;
  bool ok_ = true;
};

// Group sizes as "3;3;0": the trailing 0 repeats the last size, as an unterminated list
// does in the sources; a list ended by -1 stops grouping after its last size.
std::u32string groupingText(const Values &v) {
  std::string out;
  bool stop = false;
  for (const auto &val : v) {
    int n = 0;
    if (!Fetch::toInt(val.text, &n) || n <= 0 || n >= 127) {
      stop = n < 0 || n >= 127;
      break;
    }
    out += std::to_string(n) + ";";
  }
  if (out.empty()) return U"0";
  if (stop) out.pop_back();
  else out += "0";
  return locsrc::fromUtf8(out);
}

std::u32string trimRight(std::u32string s) {
  while (!s.empty() && s.back() == U' ') s.pop_back();
  return s;
}

uint16_t firstUnit(const std::u32string &s) { return s.empty() ? 0 : locsrc::toUtf16(s)[0]; }

// Separators the single-byte code pages of these territories lack become the nearest
// character they carry: narrow and thin spaces the no-break space, the typographic
// apostrophe the plain one.
uint16_t separator(const std::u32string &s) {
  uint16_t u = firstUnit(s);
  return u == 0x202F || u == 0x2009 ? 0x00A0 : u == 0x2019 ? 0x0027 : u;
}

std::u32string lowerAscii(std::u32string s) {
  for (auto &c : s)
    if (c >= U'A' && c <= U'Z') c += 32;
  return s;
}
std::u32string upperAscii(std::u32string s) {
  for (auto &c : s)
    if (c >= U'a' && c <= U'z') c -= 32;
  return s;
}

// The name most locales of a language code give their language ("English", though the
// United States locale says "American English"); on a tie the shorter name.
std::u32string languageDisplayName(locsrc::SourceSet &set, const std::string &code, const std::u32string &own) {
  std::map<std::u32string, int> votes;
  std::error_code ec;
  for (const auto &e : std::filesystem::directory_iterator(set.dir(), ec)) {
    std::string file = e.path().filename().string();
    if (file.rfind(code + "_", 0) != 0) continue;
    std::string ignored;
    const Values *v = set.find(file, "LC_IDENTIFICATION", "language", &ignored);
    if (v != nullptr && v->size() == 1 && !(*v)[0].text.empty()) ++votes[(*v)[0].text];
  }
  std::u32string best = own;
  int bestVotes = votes.count(own) ? votes[own] : 0;
  for (const auto &[name, n] : votes) {
    if (n > bestVotes || (n == bestVotes && name.size() < best.size())) {
      best = name;
      bestVotes = n;
    }
  }
  return best;
}

bool buildTerritory(locsrc::SourceSet &set, const NativeRow &row, DefObject *obj, std::string *err) {
  std::string src = sourceFor(row.native);
  Fetch f(set, src, err);
  obj->type = 1;
  obj->name = row.territory;

  std::u32string code = upperAscii(f.text("LC_ADDRESS", "country_ab2"));
  std::u32string display = f.text("LC_IDENTIFICATION", "territory");
  int number = f.number("LC_ADDRESS", "country_num");
  auto ident = kIdentity.find(row.territory);
  if (ident != kIdentity.end()) {
    code = locsrc::fromUtf8(ident->second.code);
    display = ident->second.display;
    number = ident->second.number;
  }
  if (f.ok() && (number <= 0 || number > 65535)) f.fail(src + ": country_num out of range");
  obj->id = static_cast<uint16_t>(number);

  locsrc::TimeFormats tf;
  tf.dFmt = f.text("LC_TIME", "d_fmt");
  tf.tFmt = f.text("LC_TIME", "t_fmt");
  tf.dtFmt = f.text("LC_TIME", "d_t_fmt");
  tf.tFmtAmPm = f.text("LC_TIME", "t_fmt_ampm", true);
  tf.dateFmt = f.text("LC_TIME", "date_fmt", true);
  std::u32string shortDate = locsrc::translatePattern(tf.dFmt, tf);

  const Values *grouping = f.values("LC_NUMERIC", "grouping", 0);
  const Values *monGrouping = f.values("LC_MONETARY", "mon_grouping", 0);
  int frac = f.number("LC_MONETARY", "frac_digits");
  int intFrac = f.number("LC_MONETARY", "int_frac_digits");
  auto digits = [](int n) { return static_cast<uint16_t>(n >= 0 && n <= 9 ? n : 2); };
  auto posn = [](int n) { return static_cast<uint16_t>(n >= 0 && n <= 4 ? n : 1); };
  auto flag = [&](const char *key, int bit) { return static_cast<uint16_t>(f.number("LC_MONETARY", key) == 1 ? 1 << bit : 0); };

  Body b(kTerritoryWords);
  b.word(0, separator(f.text("LC_NUMERIC", "decimal_point")));
  b.word(1, separator(f.text("LC_NUMERIC", "thousands_sep")));
  b.word(2, static_cast<uint16_t>(locsrc::toUtf16({locsrc::firstLiteral(shortDate)})[0]));
  b.word(3, separator(f.text("LC_MONETARY", "mon_decimal_point")));
  b.word(4, separator(f.text("LC_MONETARY", "mon_thousands_sep")));
  b.word(5, digits(frac));  // numeric precision follows the local currency
  b.word(6, digits(frac));
  b.word(7, digits(intFrac));
  b.word(8, static_cast<uint16_t>(posn(f.number("LC_MONETARY", "p_sign_posn")) << 8 |
                                  posn(f.number("LC_MONETARY", "n_sign_posn"))));
  b.word(9, obj->id);
  b.word(10, flag("p_cs_precedes", 1) | flag("p_sep_by_space", 2) | flag("n_cs_precedes", 3) |
                 flag("n_sep_by_space", 4));
  b.text(11, code);
  b.text(12, display);
  b.text(13, grouping ? groupingText(*grouping) : U"0");
  b.text(14, monGrouping ? groupingText(*monGrouping) : U"0");
  b.text(15, f.text("LC_MONETARY", "currency_symbol"));
  b.text(16, trimRight(f.text("LC_MONETARY", "int_curr_symbol")));
  b.text(17, f.text("LC_MONETARY", "positive_sign"));
  b.text(18, f.text("LC_MONETARY", "negative_sign"));
  b.text(19, locsrc::translatePattern(tf.tFmt, tf));
  b.text(20, shortDate);
  b.text(21, locsrc::longDatePattern(tf));
  if (!f.ok()) return false;
  obj->sections.resize(1);
  return b.finish(obj->name, &obj->sections[0], err);
}

const NativeRow *primaryRow(const std::vector<const NativeRow *> &rows,
                            const std::map<std::string, const NativeRow *> &territoryRow) {
  for (const NativeRow *r : rows)
    if (codesMatch(r->native)) return r;
  for (const NativeRow *r : rows)
    if (std::string(territoryRow.at(r->territory)->language) == r->language) return r;
  return rows.front();
}

// The code page of the first row that is not UTF-8, looked for among the primary's own
// forms first; empty when the language has only UTF-8 rows.
std::string defaultCodePage(const std::vector<const NativeRow *> &rows, const NativeRow &primary) {
  for (bool samePrefix : {true, false}) {
    for (const NativeRow *r : rows) {
      if (std::string(r->codePage) != "UTF-8" && (!samePrefix || prefixOf(r->native) == prefixOf(primary.native)))
        return r->codePage;
    }
  }
  return {};
}

bool buildLanguage(locsrc::SourceSet &set, const std::string &name, const NativeRow &primary,
                   uint16_t territoryId, uint16_t codePageId, const Casing *casing, DefObject *obj,
                   std::vector<std::string> *report, std::string *err) {
  std::string src = sourceFor(primary.native);
  Fetch f(set, src, err);
  obj->type = 0;
  obj->name = name;

  std::u32string code = lowerAscii(f.text("LC_ADDRESS", "lang_ab"));
  std::u32string display = f.text("LC_IDENTIFICATION", "language");
  auto ident = kIdentity.find(name);
  if (ident != kIdentity.end()) {
    code = locsrc::fromUtf8(ident->second.code);
    display = ident->second.display;
  } else if (f.ok()) {
    display = languageDisplayName(set, locsrc::toUtf8(code), display);
  }

  Body b(kLanguageWords);
  b.word(0, territoryId);
  b.word(1, codePageId);
  b.word(2, 0);
  SpecialTables sp;
  if (casing) sp = specialTablesFor(casing->rules, locsrc::toUtf8(code), casing->ucd);
  b.word(3, static_cast<uint16_t>(sp.upper.size()));
  b.word(4, static_cast<uint16_t>(sp.lower.size()));
  b.table(49, sp.upper);
  b.table(50, sp.lower);
  b.word(51, sp.upper.empty() && sp.lower.empty() ? 0 : 1);
  if (report && casing) {
    std::string line = name + ": special casing " + std::to_string(sp.upper.size()) + " upper, " +
                       std::to_string(sp.lower.size()) + " lower";
    for (const std::string &u : sp.unfit) line += "\n    not carried: " + u;
    report->push_back(line);
  }
  b.text(5, code);
  b.text(6, display);
  struct Names {
    const char *key;
    size_t count, firstWord, slots;
  };
  for (const Names &n : {Names{"day", 7, 7, 7}, Names{"abday", 7, 14, 7}, Names{"mon", 12, 21, 13},
                         Names{"abmon", 12, 34, 13}, Names{"am_pm", 2, 47, 2}}) {
    const Values *v = f.values("LC_TIME", n.key, n.count);
    for (size_t k = 0; k < n.slots; ++k) b.text(n.firstWord + k, v != nullptr && k < n.count ? (*v)[k].text : U"");
  }
  if (!f.ok()) return false;
  obj->sections.resize(1);
  return b.finish(obj->name, &obj->sections[0], err);
}

}  // namespace

bool buildLanguagesAndTerritories(const std::string &localeSrcDir,
                                  const std::function<uint16_t(const std::string &)> &codePageId,
                                  std::vector<DefObject> *out, std::string *err, const Casing *casing,
                                  std::vector<std::string> *report) {
  locsrc::SourceSet set(localeSrcDir);
  std::vector<std::string> languages;
  std::map<std::string, std::vector<const NativeRow *>> rowsOf;
  std::map<std::string, const NativeRow *> territoryRow;
  std::vector<std::string> territories;
  for (const NativeRow &r : kRows) {
    if (rowsOf[r.language].empty()) languages.push_back(r.language);
    rowsOf[r.language].push_back(&r);
  }
  // Rows of the languages added later name a territory only when no older row does, so
  // adding "ca_ES" leaves Spain read from "es_ES".
  for (bool later : {false, true})
    for (const NativeRow &r : kRows)
      if ((addedRank(r.language) != 0) == later && territoryRow.emplace(r.territory, &r).second)
        territories.push_back(r.territory);

  std::vector<DefObject> territoryObjs;
  std::map<std::string, uint16_t> territoryIds;
  std::set<uint16_t> usedIds;
  for (const std::string &t : territories) {
    DefObject obj;
    if (!buildTerritory(set, *territoryRow[t], &obj, err)) return false;
    if (!usedIds.insert(obj.id).second) {
      *err = t + ": territory number " + std::to_string(obj.id) + " used twice";
      return false;
    }
    territoryIds[t] = obj.id;
    territoryObjs.push_back(std::move(obj));
  }
  std::sort(territoryObjs.begin(), territoryObjs.end(),
            [](const DefObject &a, const DefObject &b) { return a.id < b.id; });

  std::sort(languages.begin(), languages.end(), [](const std::string &a, const std::string &b) {
    if (addedRank(a) != addedRank(b)) return addedRank(a) < addedRank(b);
    return (a == "English") != (b == "English") ? a == "English" : a < b;
  });
  std::vector<DefObject> objs;
  for (size_t i = 0; i < languages.size(); ++i) {
    const auto &rows = rowsOf[languages[i]];
    const NativeRow *primary = primaryRow(rows, territoryRow);
    std::string cpName = defaultCodePage(rows, *primary);
    DefObject obj;
    obj.id = static_cast<uint16_t>(i + 1);
    if (!buildLanguage(set, languages[i], *primary, territoryIds[primary->territory],
                       cpName.empty() ? 0 : codePageId(cpName), casing, &obj, report, err))
      return false;
    objs.push_back(std::move(obj));
  }
  objs.insert(objs.end(), std::make_move_iterator(territoryObjs.begin()),
              std::make_move_iterator(territoryObjs.end()));
  *out = std::move(objs);
  return true;
}

}  // namespace mkdefs
