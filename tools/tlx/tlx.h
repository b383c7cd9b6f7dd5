// Commands of the tlx tool; each lives in a file of its own.
#pragma once
#include <string>

#include "veltrin.h"

int cmdLocale(int argc, char **argv);
int cmdConvert(int argc, char **argv);
int cmdInfo(int argc, char **argv);
int cmdTranslate(int argc, char **argv);
int cmdGencat(int argc, char **argv);
int cmdCatalog(int argc, char **argv);
int cmdDate(int argc, char **argv);

// The definitions directory: --dir, else VL_LOCALEDIR, else the one built beside the tool.
const char *defsDir(const char *given);

// UTF-16 for the terminal: UTF-8 when it takes UTF-8, else ASCII with \u escapes.
std::string forTerminal(const VLUChar *u, bool utf8);
