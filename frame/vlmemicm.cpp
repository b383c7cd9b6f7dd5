#include <cctype>

#include "frame/frame.h"

int VLmemicmp(const void *a, const void *b, size_t length) {
  const unsigned char *x = static_cast<const unsigned char *>(a);
  const unsigned char *y = static_cast<const unsigned char *>(b);
  for (size_t i = 0; i < length; ++i) {
    if (x[i] == y[i]) continue;
    int d = std::tolower(x[i]) - std::tolower(y[i]);
    if (d) return d;
  }
  return 0;
}
