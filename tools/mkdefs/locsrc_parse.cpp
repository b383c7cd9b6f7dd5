// Reader for the C library's locale source format: categories between "LC_x" and
// "END LC_x", one keyword a logical line with ";"-separated operands, quoted strings with
// <Uxxxx> symbols and an escape character, lines joined by a trailing escape character.
#include "locsrc_parse.h"

#include <fstream>
#include <sstream>

namespace mkdefs::locsrc {
namespace {

// Decodes one UTF-8 sequence at s[i]; malformed bytes come out as U+FFFD, one at a time.
size_t decodeAt(const std::string &s, size_t i, char32_t *cp) {
  auto b = static_cast<unsigned char>(s[i]);
  size_t len = b < 0x80 ? 1 : (b >> 5) == 6 ? 2 : (b >> 4) == 14 ? 3 : (b >> 3) == 30 ? 4 : 0;
  if (len == 1) {
    *cp = b;
    return 1;
  }
  if (len == 0 || i + len > s.size()) {
    *cp = 0xFFFD;
    return 1;
  }
  char32_t v = b & (0x7F >> len);
  for (size_t k = 1; k < len; ++k) {
    auto c = static_cast<unsigned char>(s[i + k]);
    if ((c & 0xC0) != 0x80) {
      *cp = 0xFFFD;
      return 1;
    }
    v = (v << 6) | (c & 0x3F);
  }
  *cp = v;
  return len;
}

int hexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

// "<U00E4>" at s[i]: the code point and the length of the symbol, or 0.
size_t unicodeSymbol(const std::string &s, size_t i, char32_t *cp) {
  if (i + 2 >= s.size() || s[i] != '<' || s[i + 1] != 'U') return 0;
  size_t j = i + 2;
  char32_t v = 0;
  while (j < s.size() && hexValue(s[j]) >= 0 && j - i - 2 < 8) {
    v = v * 16 + static_cast<char32_t>(hexValue(s[j]));
    ++j;
  }
  if (j >= s.size() || s[j] != '>' || j - i - 2 < 4 || v > 0x10FFFF) return 0;
  *cp = v;
  return j + 1 - i;
}

enum class Tok { Word, String, Semi };
struct Token {
  Tok kind;
  std::u32string text;
};

class Reader {
 public:
  Reader(const std::vector<std::string> &keep, SourceFile *out) : keep_(keep), out_(out) {}

  bool run(const std::string &t, std::string *err) {
    size_t i = 0, n = t.size();
    std::vector<Token> line;
    auto atLineEnd = [&](size_t k) {
      return k < n && (t[k] == '\n' || (t[k] == '\r' && k + 1 < n && t[k + 1] == '\n'));
    };
    auto skipNewline = [&](size_t k) { return t[k] == '\n' ? k + 1 : k + 2; };
    while (i < n) {
      char c = t[i];
      if (c == '\n') {
        handle(line);
        line.clear();
        ++i;
      } else if (c == ' ' || c == '\t' || c == '\r' || c == '\f' || c == '\v') {
        ++i;
      } else if (c == esc_ && atLineEnd(i + 1)) {
        i = skipNewline(i + 1);  // continuation
      } else if (c == com_) {
        // A comment ending in the escape character still continues the line, as the C
        // library reads "day "x"; % note /" lists.
        size_t end = i;
        while (end < n && t[end] != '\n') ++end;
        size_t last = end;
        while (last > i && (t[last - 1] == '\r' || t[last - 1] == ' ' || t[last - 1] == '\t')) --last;
        i = last > i + 1 && t[last - 1] == esc_ && end < n ? end + 1 : end;
      } else if (c == ';') {
        line.push_back({Tok::Semi, {}});
        ++i;
      } else if (c == '"') {
        Token tok{Tok::String, {}};
        ++i;
        while (i < n && t[i] != '"' && t[i] != '\n') {
          char32_t cp;
          size_t len;
          if (t[i] == esc_ && atLineEnd(i + 1)) {
            i = skipNewline(i + 1);
            continue;
          }
          if (t[i] == esc_ && i + 1 < n) {
            i += 1 + decodeAt(t, i + 1, &cp);
          } else if ((len = unicodeSymbol(t, i, &cp)) != 0) {
            i += len;
          } else {
            i += decodeAt(t, i, &cp);
          }
          tok.text.push_back(cp);
        }
        if (i < n && t[i] == '"') ++i;
        line.push_back(std::move(tok));
      } else {
        Token tok{Tok::Word, {}};
        while (i < n && t[i] != ' ' && t[i] != '\t' && t[i] != '\n' && t[i] != '\r' && t[i] != ';' &&
               t[i] != '"') {
          char32_t cp;
          if (t[i] == esc_ && atLineEnd(i + 1)) break;
          if (t[i] == esc_ && i + 1 < n) ++i;
          i += decodeAt(t, i, &cp);
          tok.text.push_back(cp);
        }
        line.push_back(std::move(tok));
      }
    }
    handle(line);
    if (!category_.empty()) {
      *err = "category " + category_ + " not ended";
      return false;
    }
    return true;
  }

 private:
  void handle(const std::vector<Token> &line) {
    if (line.empty() || line[0].kind != Tok::Word) return;
    std::string key = toUtf8(line[0].text);
    if (category_.empty()) {
      if (key.rfind("LC_", 0) == 0) {
        category_ = key;
        current_ = nullptr;
        bool kept = keep_.empty();
        for (const auto &k : keep_) kept = kept || k == key;
        if (kept) current_ = &out_->categories[key];
      } else if ((key == "comment_char" || key == "escape_char") && line.size() > 1 &&
                 line[1].kind == Tok::Word && line[1].text.size() == 1 && line[1].text[0] < 0x80) {
        (key == "comment_char" ? com_ : esc_) = static_cast<char>(line[1].text[0]);
      }
      return;
    }
    if (key == "END") {
      category_.clear();
      current_ = nullptr;
      return;
    }
    if (current_ == nullptr) return;
    Values vals;
    Value v;
    bool any = false;
    for (size_t k = 1; k < line.size(); ++k) {
      if (line[k].kind == Tok::Semi) {
        vals.push_back(std::move(v));
        v = Value{};
        any = false;
        continue;
      }
      v.quoted = v.quoted || line[k].kind == Tok::String;
      v.text += line[k].text;
      any = true;
    }
    if (any || !vals.empty()) vals.push_back(std::move(v));
    if (key == "copy") {
      if (!vals.empty() && current_->copyFrom.empty()) current_->copyFrom = toUtf8(vals[0].text);
      return;
    }
    current_->keys.emplace(key, std::move(vals));
  }

  const std::vector<std::string> &keep_;
  SourceFile *out_;
  char com_ = '#', esc_ = '\\';
  std::string category_;
  Category *current_ = nullptr;
};

}  // namespace

bool parseSource(const std::string &text, const std::vector<std::string> &keep, SourceFile *out,
                 std::string *err) {
  Reader r(keep, out);
  return r.run(text, err);
}

SourceSet::SourceSet(std::string dir) : dir_(std::move(dir)) {}

static bool plainName(const std::string &locale) {
  return !locale.empty() && locale.find('/') == std::string::npos && locale[0] != '.';
}

bool SourceSet::exists(const std::string &locale) const {
  std::ifstream f(dir_ + "/" + locale);
  return plainName(locale) && f.good();
}

const SourceFile *SourceSet::load(const std::string &locale, std::string *err) {
  auto it = files_.find(locale);
  if (it != files_.end()) return it->second.get();
  std::ifstream f(dir_ + "/" + locale, std::ios::binary);
  if (!plainName(locale) || !f) {
    *err = "cannot read locale source " + dir_ + "/" + locale;
    return nullptr;
  }
  std::stringstream ss;
  ss << f.rdbuf();
  auto file = std::make_unique<SourceFile>();
  static const std::vector<std::string> keep = {"LC_TIME", "LC_NUMERIC", "LC_MONETARY",
                                                "LC_IDENTIFICATION", "LC_ADDRESS"};
  std::string perr;
  if (!parseSource(ss.str(), keep, file.get(), &perr)) {
    *err = locale + ": " + perr;
    return nullptr;
  }
  return (files_[locale] = std::move(file)).get();
}

const Values *SourceSet::find(const std::string &locale, const std::string &category, const std::string &key,
                              std::string *err) {
  std::string name = locale;
  for (int depth = 0; depth < 16; ++depth) {
    const SourceFile *f = load(name, err);
    if (f == nullptr) return nullptr;
    auto c = f->categories.find(category);
    if (c == f->categories.end()) return nullptr;
    auto k = c->second.keys.find(key);
    if (k != c->second.keys.end()) return &k->second;
    if (c->second.copyFrom.empty()) return nullptr;
    name = c->second.copyFrom;
  }
  *err = locale + ": copy chain too long in " + category;
  return nullptr;
}

std::u32string fromUtf8(const std::string &s) {
  std::u32string out;
  for (size_t i = 0; i < s.size();) {
    char32_t cp;
    i += decodeAt(s, i, &cp);
    out.push_back(cp);
  }
  return out;
}

std::string toUtf8(const std::u32string &s) {
  std::string out;
  for (char32_t c : s) {
    if (c < 0x80) {
      out += static_cast<char>(c);
    } else if (c < 0x800) {
      out += static_cast<char>(0xC0 | (c >> 6));
      out += static_cast<char>(0x80 | (c & 0x3F));
    } else if (c < 0x10000) {
      out += static_cast<char>(0xE0 | (c >> 12));
      out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (c & 0x3F));
    } else {
      out += static_cast<char>(0xF0 | (c >> 18));
      out += static_cast<char>(0x80 | ((c >> 12) & 0x3F));
      out += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
      out += static_cast<char>(0x80 | (c & 0x3F));
    }
  }
  return out;
}

std::u16string toUtf16(const std::u32string &s) {
  std::u16string out;
  for (char32_t c : s) {
    if (c >= 0x10000 && c <= 0x10FFFF) {
      out += static_cast<char16_t>(0xD800 + ((c - 0x10000) >> 10));
      out += static_cast<char16_t>(0xDC00 + ((c - 0x10000) & 0x3FF));
    } else {
      out += static_cast<char16_t>(c > 0x10FFFF ? 0xFFFD : c);
    }
  }
  return out;
}

}  // namespace mkdefs::locsrc
