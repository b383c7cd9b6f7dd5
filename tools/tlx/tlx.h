// Commands of the tlx tool; each lives in a file of its own.
#pragma once
#include <cstdio>
#include <string>

#include "veltrin.h"

int cmdLocale(int argc, char **argv);
int cmdConvert(int argc, char **argv);
int cmdInfo(int argc, char **argv);
int cmdTranslate(int argc, char **argv);
int cmdGencat(int argc, char **argv);
int cmdCatalog(int argc, char **argv);
int cmdDate(int argc, char **argv);
int cmdFormat(int argc, char **argv);
int cmdParse(int argc, char **argv);
int cmdMap(int argc, char **argv);
int cmdSort(int argc, char **argv);

// The definitions directory: --dir, else VL_LOCALEDIR, else the build's own (build-tree tool
// only), else null: the library's built-in location.
const char *defsDir(const char *given);

// UTF-16 for the terminal: UTF-8 when it takes UTF-8, else ASCII with \u escapes.
std::string forTerminal(const VLUChar *u, bool utf8);
// Appends one UTF-16 unit as UTF-8 (a lone surrogate as its three bytes).
inline void appendUtf8(std::string &s, unsigned c) {
  if (c < 0x80) {
    s += static_cast<char>(c);
  } else if (c < 0x800) {
    s += static_cast<char>(0xC0 | (c >> 6));
    s += static_cast<char>(0x80 | (c & 0x3F));
  } else {
    s += static_cast<char>(0xE0 | (c >> 12));
    s += static_cast<char>(0x80 | ((c >> 6) & 0x3F));
    s += static_cast<char>(0x80 | (c & 0x3F));
  }
}

// An input file, or standard input for null or "-"; closed when it goes. A file that
// cannot be opened is reported under the command's name and leaves f null.
struct Input {
  FILE *f = nullptr;
  const char *shown;
  Input(const char *command, const char *path);
  ~Input();
  Input(const Input &) = delete;
  Input &operator=(const Input &) = delete;
};
