// Commands of the tlx tool; each lives in a file of its own.
#pragma once

int cmdLocale(int argc, char **argv);
int cmdConvert(int argc, char **argv);
int cmdInfo(int argc, char **argv);
int cmdTranslate(int argc, char **argv);
int cmdSort(int argc, char **argv);

// The definitions directory: --dir, else VL_LOCALEDIR, else the one built beside the tool.
const char *defsDir(const char *given);
