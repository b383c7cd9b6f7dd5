// Reader for the C library's locale source files (/usr/share/i18n/locales).
#pragma once
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace mkdefs::locsrc {

// One operand of a keyword: a quoted string (decoded, <Uxxxx> resolved) or a bare word
// such as a number. Operands are the ";"-separated parts after the keyword.
struct Value {
  bool quoted = false;
  std::u32string text;
};
using Values = std::vector<Value>;

struct Category {
  std::string copyFrom;                 // "copy" target, empty when none
  std::map<std::string, Values> keys;   // first definition of each keyword wins
};

struct SourceFile {
  std::map<std::string, Category> categories;  // "LC_TIME" -> ...
};

// Parses one file. Only the categories named in keep are stored (all when keep is empty).
bool parseSource(const std::string &text, const std::vector<std::string> &keep, SourceFile *out,
                 std::string *err);

// Files of one directory, read on first use; lookups follow "copy" directives.
class SourceSet {
 public:
  explicit SourceSet(std::string dir);
  bool exists(const std::string &locale) const;
  // The operands of key in category of locale, or null (err set when a file failed).
  const Values *find(const std::string &locale, const std::string &category, const std::string &key,
                     std::string *err);
  const std::string &dir() const { return dir_; }

 private:
  const SourceFile *load(const std::string &locale, std::string *err);
  std::string dir_;
  std::map<std::string, std::unique_ptr<SourceFile>> files_;
};

std::u32string fromUtf8(const std::string &s);
std::string toUtf8(const std::u32string &s);
std::u16string toUtf16(const std::u32string &s);

}  // namespace mkdefs::locsrc
