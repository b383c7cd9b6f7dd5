/* The public headers compile as C11, and the library links and runs from plain C. */
#include <stdio.h>
#include <string.h>

#include "nls1.h"
#include "veltrin.h"

int main(void) {
  uint32_t rc = VLInit("/nonexistent-veltrin-dir", NULL, NULL, 0, 0);
  if (rc != VL_RC_OK && rc != VL_RC_DEFAULTS) {
    printf("VLInit failed: %u\n", (unsigned)rc);
    return 1;
  }
  VLLocale *l = VLGetLocale("", 0, &rc);
  if (!l || rc != 0) {
    printf("VLGetLocale failed: %u\n", (unsigned)rc);
    return 1;
  }
  int ok = strcmp(l->language->name, "English") == 0 && (l->flags & VL_LF_BINARY) != 0;
  VLReleaseLocale(l);
  VLTerm();
  printf("%s\n", ok ? "1 passed, 0 failed" : "0 passed, 1 failed");
  return ok ? 0 : 1;
}
