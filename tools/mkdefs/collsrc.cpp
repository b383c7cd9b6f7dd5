// LC_COLLATE as the C library's localedef reads it: "copy" pulls a file's whole table in,
// "reorder-after" moves the following lines after a named entry (taking them out of their
// old place), "define"/"ifdef" pick variants, ".." lines fill a range of characters.
#include "collsrc.h"

#include <cstdio>
#include <fstream>
#include <sstream>

#include "locsrc_parse.h"

namespace mkdefs::coll {
namespace {

std::string canonical(char32_t c) {
  char b[16];
  std::snprintf(b, sizeof b, "<U%04X>", static_cast<unsigned>(c));
  return b;
}

struct Reader {
  Table *t;
  std::string dir;
  std::string *err;
  std::map<std::string, std::list<Entry>::iterator> where;
  std::set<std::string> defines;
  int section = -1;
  bool reordering = false;
  std::list<Entry>::iterator insertAt;
  int reorderSection = -1;
  bool pendingRange = false;
  Entry rangeTemplate;
  char32_t lastChar = 0;
  int depth = 0;

  bool fail(const std::string &file, int line, const std::string &msg) {
    *err = file + ":" + std::to_string(line) + ": " + msg;
    return false;
  }

  // Splits a line into tokens: <names> (with the escape char honoured), "strings" kept
  // with their quotes, ';' as its own token, and bare words.
  static std::vector<std::string> tokens(const std::string &s, char esc) {
    std::vector<std::string> out;
    size_t i = 0;
    while (i < s.size()) {
      char c = s[i];
      if (c == ' ' || c == '\t' || c == '\r') {
        ++i;
      } else if (c == ';') {
        out.push_back(";");
        ++i;
      } else if (c == '"') {
        std::string tok = "\"";
        ++i;
        while (i < s.size() && s[i] != '"') {
          if (s[i] == esc && i + 1 < s.size()) ++i;
          tok += s[i++];
        }
        ++i;
        out.push_back(tok + "\"");
      } else if (c == '<') {
        std::string tok = "<";
        ++i;
        while (i < s.size() && s[i] != '>') {
          if (s[i] == esc && i + 1 < s.size()) ++i;
          tok += s[i++];
        }
        ++i;
        tok += ">";  // "<A>..<B>" stays one token
        if (s.compare(i, 3, "..<") == 0) {
          size_t e = s.find('>', i + 3);
          if (e == std::string::npos) e = s.size() - 1;
          tok += s.substr(i, e + 1 - i);
          i = e + 1;
        }
        out.push_back(tok);
      } else {
        std::string tok;
        while (i < s.size() && s[i] != ' ' && s[i] != '\t' && s[i] != ';' && s[i] != '\r') tok += s[i++];
        out.push_back(tok);
      }
    }
    return out;
  }

  static std::string norm(const std::string &name) {
    char32_t c = charOf(name);
    return c ? canonical(c) : name;
  }

  // The names of a quoted string or a single token: "<a><b>" or literal characters.
  static std::vector<std::string> names(const std::string &tok) {
    std::vector<std::string> out;
    if (tok.empty() || tok == "IGNORE") return out;
    if (tok[0] != '"') {
      out.push_back(tok == ".." ? tok : norm(tok));
      return out;
    }
    std::string body = tok.substr(1, tok.size() - 2);
    for (size_t i = 0; i < body.size();) {
      if (body[i] == '<') {
        size_t e = body.find('>', i);
        if (e == std::string::npos) break;
        out.push_back(norm(body.substr(i, e - i + 1)));
        i = e + 1;
      } else {
        size_t n = 1;
        unsigned char lead = static_cast<unsigned char>(body[i]);
        if (lead >= 0xF0) n = 4; else if (lead >= 0xE0) n = 3; else if (lead >= 0xC0) n = 2;
        std::u32string u = locsrc::fromUtf8(body.substr(i, n));
        if (!u.empty()) out.push_back(canonical(u[0]));
        i += n;
      }
    }
    return out;
  }

  void place(Entry e) {
    auto old = where.find(e.name);
    if (old != where.end()) {
      if (reordering && old->second == insertAt) ++insertAt;
      t->order.erase(old->second);
    }
    std::list<Entry>::iterator it;
    if (reordering) {
      e.section = reorderSection;
      it = t->order.insert(insertAt, std::move(e));
    } else {
      e.section = section;
      it = t->order.insert(t->order.end(), std::move(e));
    }
    where[it->name] = it;
  }

  // An entry line: name and up to four ';'-separated weight fields.
  bool entry(const std::vector<std::string> &tk, const std::string &file, int ln) {
    Entry e;
    e.name = tk[0] == ".." ? ".." : norm(tk[0]);
    if (tk.size() > 1) {
      e.weighed = true;
      size_t lvl = 0;
      bool any = false;
      for (size_t i = 1; i < tk.size() && lvl < 4; ++i) {
        if (tk[i] == ";") {
          if (!any) e.level[lvl].clear();
          ++lvl;
          any = false;
          continue;
        }
        for (const std::string &n : names(tk[i])) e.level[lvl].push_back(n);
        any = true;
      }
      for (size_t l = lvl + 1; l < 4; ++l) e.level[l] = {e.name};
    }
    if (e.name == "..") {
      if (!lastChar) return fail(file, ln, "range without a first character");
      pendingRange = true;
      rangeTemplate = e;
      return true;
    }
    char32_t c = charOf(e.name);
    if (pendingRange) {
      if (!c || c <= lastChar) return fail(file, ln, "range without a last character");
      for (char32_t r = lastChar + 1; r < c; ++r) {
        Entry x = rangeTemplate;
        x.name = canonical(r);
        for (auto &lv : x.level)
          for (auto &n : lv)
            if (n == "..") n = x.name;
        place(std::move(x));
      }
      pendingRange = false;
    }
    if (c) lastChar = c;
    place(std::move(e));
    return true;
  }

  bool file(const std::string &name) {
    if (++depth > 8) return fail(name, 0, "copy nests too deep");
    std::ifstream in(dir + "/" + name, std::ios::binary);
    if (!in) return fail(name, 0, "cannot read");
    char comment = '%', esc = '\\';
    bool inColl = false;
    std::vector<bool> skip;  // ifdef stack: true while a branch is off
    std::string raw, line;
    int ln = 0;
    while (std::getline(in, raw)) {
      ++ln;
      if (!raw.empty() && raw.back() == '\r') raw.pop_back();
      if (!raw.empty() && raw.back() == esc) {
        line += raw.substr(0, raw.size() - 1);
        continue;
      }
      line += raw;
      std::string l;
      l.swap(line);
      // Comments: from a comment char outside names and strings.
      bool inQ = false, inA = false;
      for (size_t i = 0; i < l.size(); ++i) {
        char c = l[i];
        if (c == esc) { ++i; continue; }
        if (c == '"' && !inA) inQ = !inQ;
        else if (c == '<' && !inQ) inA = true;
        else if (c == '>' && !inQ) inA = false;
        else if (c == comment && !inQ && !inA) { l.erase(i); break; }
      }
      std::vector<std::string> tk = tokens(l, esc);
      if (tk.empty()) continue;
      const std::string &k = tk[0];
      if (k == "comment_char" && tk.size() > 1) { comment = tk[1][0]; continue; }
      if (k == "escape_char" && tk.size() > 1) { esc = tk[1][0]; continue; }
      if (!inColl) {
        if (k == "LC_COLLATE") inColl = true;
        continue;
      }
      if (k == "END") break;
      if (k == "ifdef" || k == "ifndef") {
        bool on = tk.size() > 1 && defines.count(tk[1]);
        skip.push_back(k == "ifdef" ? !on : on);
        continue;
      }
      if (k == "else") { if (!skip.empty()) skip.back() = !skip.back(); continue; }
      if (k == "endif") { if (!skip.empty()) skip.pop_back(); continue; }
      bool off = false;
      for (bool s : skip) off = off || s;
      if (off) continue;
      if (k == "define" && tk.size() > 1) { defines.insert(tk[1]); continue; }
      if (k == "copy" && tk.size() > 1) {
        if (!file(tk[1].substr(1, tk[1].size() - 2))) return false;
        continue;
      }
      if (k == "script" || k == "collating-symbol" || k == "order_end") continue;
      if (k == "collating-element") {
        if (tk.size() < 4 || tk[2] != "from") return fail(name, ln, "collating-element without from");
        std::u32string s;
        for (const std::string &n : names(tk[3])) s += charOf(n);
        t->elements[tk[1]] = s;
        continue;
      }
      if (k == "order_start") {
        std::array<bool, 4> fw{true, true, true, true};
        size_t lvl = 0;
        for (size_t i = 1; i < tk.size(); ++i) {
          if (tk[i] == ";" || tk[i][0] == '<') continue;
          if (lvl < 4) fw[lvl++] = tk[i].find("backward") == std::string::npos;
        }
        t->forward.push_back(fw);
        section = static_cast<int>(t->forward.size()) - 1;
        reordering = false;
        continue;
      }
      if (k == "reorder-after") {
        auto it = tk.size() > 1 ? where.find(norm(tk[1])) : where.end();
        if (it == where.end()) return fail(name, ln, "reorder after an unknown entry");
        reordering = true;
        insertAt = std::next(it->second);
        reorderSection = it->second->section;
        continue;
      }
      if (k == "reorder-end") { reordering = false; continue; }
      if (k[0] == '<' || k == ".." || k == "UNDEFINED") {
        if (k.find("..<") != std::string::npos) continue;  // symbol ranges only declare
        if (!entry(tk, name, ln)) return false;
        continue;
      }
      return fail(name, ln, "unknown keyword " + k);
    }
    --depth;
    return true;
  }
};

}  // namespace

char32_t charOf(const std::string &name) {
  if (name.size() < 7 || name[0] != '<' || name[1] != 'U' || name.back() != '>') return 0;
  char32_t v = 0;
  for (size_t i = 2; i + 1 < name.size(); ++i) {
    char c = name[i];
    int d = c >= '0' && c <= '9' ? c - '0' : c >= 'A' && c <= 'F' ? c - 'A' + 10 : c >= 'a' && c <= 'f' ? c - 'a' + 10 : -1;
    if (d < 0 || v > 0x10FFFF) return 0;
    v = v * 16 + static_cast<char32_t>(d);
  }
  return v;
}

bool readCollation(const std::string &dir, const std::string &locale, Table *out, std::string *err) {
  Reader r{out, dir, err, {}, {}, -1, false, {}, -1, false, {}, 0, 0};
  return r.file(locale);
}

}  // namespace mkdefs::coll
