// tlx translate --from N --to N [options] [TEXT|-]: one call of the service layer's
// translation between code page numbers; the raw result goes to standard output and the
// return code and counts to standard error.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <vector>

#include "nls1.h"
#include "tools/tlx/tlx.h"

namespace {

void help(FILE *out) {
  std::fprintf(out,
               "usage: tlx translate --from N --to N [--chars] [--term] [--pad] [--lenient]\n"
               "                     [--size N] [--dir DIR] [TEXT|-]\n"
               "  Translates TEXT (or standard input, also for '-') from code page number N to\n"
               "  code page number N in one call; 1200 is UTF-16 in machine byte order. The input\n"
               "  is taken as raw bytes of the source code page, the output is written raw.\n"
               "  --chars    sizes and counts in characters (the input is read to its end)\n"
               "  --term     terminate the output with a 0 (counted)\n"
               "  --pad      fill the rest of the output with spaces\n"
               "  --lenient  cutting off only trailing spaces is not an error\n"
               "  --size N   output size (bytes, characters with --chars); default: room for all\n"
               "  --dir DIR  definitions directory (else NLS1_LOCALEDIR, VL_LOCALEDIR, the built one)\n"
               "  Standard error gets 'rc R, result N, count C'.\n"
               "  Exit status: 0 rc 0, 1 any other return code, 2 bad usage.\n");
}

bool number(const char *s, long *v) {
  char *end = nullptr;
  *v = std::strtol(s, &end, 10);
  return *s && !*end;
}

}  // namespace

int cmdTranslate(int argc, char **argv) {
  long from = -1, to = -1, size = -1;
  uint32_t options = 0;
  const char *text = nullptr, *dir = nullptr;
  for (int i = 1; i < argc; ++i) {
    const char *a = argv[i];
    bool hasValue = i + 1 < argc;
    if (!std::strcmp(a, "--help") || !std::strcmp(a, "-h")) {
      help(stdout);
      return 0;
    } else if (!std::strcmp(a, "--from") && hasValue) {
      if (!number(argv[++i], &from) || from < 0) return help(stderr), 2;
    } else if (!std::strcmp(a, "--to") && hasValue) {
      if (!number(argv[++i], &to) || to < 0) return help(stderr), 2;
    } else if (!std::strcmp(a, "--size") && hasValue) {
      if (!number(argv[++i], &size) || size < 0 || size > (1L << 30)) return help(stderr), 2;
    } else if (!std::strcmp(a, "--dir") && hasValue) {
      dir = argv[++i];
    } else if (!std::strcmp(a, "--chars")) {
      options |= NLS1_OPT_CHARLEN;
    } else if (!std::strcmp(a, "--term")) {
      options |= NLS1_OPT_NULLTERM;
    } else if (!std::strcmp(a, "--pad")) {
      options |= NLS1_OPT_PAD;
    } else if (!std::strcmp(a, "--lenient")) {
      options |= NLS1_OPT_LENIENT;
    } else if (!text && (a[0] != '-' || !std::strcmp(a, "-"))) {
      text = a;
    } else {
      std::fprintf(stderr, "tlx translate: unexpected argument '%s'\n", a);
      help(stderr);
      return 2;
    }
  }
  if (from < 0 || to < 0) {
    help(stderr);
    return 2;
  }
  // The service layer finds its definitions through its own variable.
  if (!std::getenv("NLS1_LOCALEDIR"))
    if (const char *d = defsDir(dir)) setenv("NLS1_LOCALEDIR", d, 1);

  std::string input;
  if (!text || !std::strcmp(text, "-")) {
    char buf[4096];
    size_t n;
    while ((n = std::fread(buf, 1, sizeof buf, stdin)) > 0) input.append(buf, n);
  } else {
    input = text;
  }
  int32_t length = static_cast<int32_t>(input.size());
  if (options & NLS1_OPT_CHARLEN) {
    // Counting characters needs the library: let it measure up to the terminator.
    input.append(2, '\0');
    length = -1;
  }
  if (size < 0) size = static_cast<long>(input.size()) * 4 + 16;
  // With --chars the result counts characters, not bytes: the call runs over two
  // differently filled buffers, and the written prefix is where they agree.
  const bool chars = (options & NLS1_OPT_CHARLEN) != 0;
  const size_t room = static_cast<size_t>(size) * (chars ? 8 : 1) + 8;
  std::vector<unsigned char> out(room, 0x00), probe(room, 0xFF);
  int32_t count = 0;
  uint32_t rc = 0;
  auto run = [&](std::vector<unsigned char> &buf) {
    return NLS1_TranslateString(static_cast<uint32_t>(to), buf.data(), static_cast<int32_t>(size),
                                static_cast<uint32_t>(from), input.data(), length, &count, options, &rc);
  };
  if (chars) run(probe);
  int32_t n = run(out);
  if (n > 0) {
    size_t bytes = static_cast<size_t>(n);
    if (chars)
      for (bytes = room; bytes > 0 && out[bytes - 1] != probe[bytes - 1];) --bytes;
    std::fwrite(out.data(), 1, bytes, stdout);
  }
  std::fflush(stdout);
  std::fprintf(stderr, "rc %u, result %d, count %d\n", rc, n, count);
  return rc == 0 ? 0 : 1;
}
