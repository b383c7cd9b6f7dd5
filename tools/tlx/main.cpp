// tlx: the command-line face of the library.
#include <cstdio>
#include <cstring>

#include "tools/tlx/tlx.h"

namespace {

struct Command {
  const char *name;
  int (*run)(int argc, char **argv);
  const char *summary;
};

const Command kCommands[] = {
    {"locale", cmdLocale, "locale NAME [--dir DIR]      build a locale and show what it is made of"},
    {"convert", cmdConvert, "convert -f FROM -t TO [FILE...]  convert text between code pages"},
    {"info", cmdInfo, "info LOCALE [--items N,...] [--defaults]  show the information items of a locale"},
    {"gencat", cmdGencat, "gencat [--locale NAME] OUTPUT.cat SOURCE.msg...  compile message sources"},
    {"catalog", cmdCatalog, "catalog FILE.cat            list a catalog as message source"},
    {"date", cmdDate, "date [--locale NAME] [--format P|--short|--long|--time] [--parse TEXT]  write or read a time"},
    {"translate", cmdTranslate, "translate --from N --to N [options]  translate a string between code pages"},
    {"format", cmdFormat, "format number|currency [--locale NAME] [--intl] VALUE...  write numbers as a locale does"},
    {"parse", cmdParse, "parse number [--locale NAME] [--money] TEXT...  read numbers written by a locale"},
    {"map", cmdMap, "map --lower|--upper|--full-width|--half-width|--digits [--simple] [--locale NAME] [FILE...]"},
    {"sort", cmdSort, "sort [--locale NAME] [options] [FILE...]  sort lines by a locale's collation"},
};

void usage(FILE *out) {
  std::fprintf(out, "usage: tlx COMMAND [ARGS]\n\ncommands:\n");
  for (const Command &c : kCommands) std::fprintf(out, "  %s\n", c.summary);
}

}  // namespace

int main(int argc, char **argv) {
  if (argc < 2 || !std::strcmp(argv[1], "--help") || !std::strcmp(argv[1], "-h")) {
    usage(argc < 2 ? stderr : stdout);
    return argc < 2 ? 2 : 0;
  }
  for (const Command &c : kCommands)
    if (!std::strcmp(argv[1], c.name)) return c.run(argc - 1, argv + 1);
  std::fprintf(stderr, "tlx: unknown command '%s'\n", argv[1]);
  usage(stderr);
  return 2;
}
