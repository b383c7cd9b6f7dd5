/* A program built against the installed library: a locale from the installed definitions. */
#include <stdio.h>
#include <string.h>

#include <veltrin.h>

int main(void) {
  uint32_t rc = VLInit(NULL, NULL, NULL, 0, 0);
  if (rc != VL_RC_OK) {
    printf("VLInit: %u\n", (unsigned)rc);
    return 1;
  }
  VLLocale *l = VLGetLocale("German_Germany.Latin1", 0, &rc);
  int ok = l && rc == 0 && strcmp(l->language->name, "German") == 0;
  if (l) VLReleaseLocale(l);
  VLTerm();
  printf("%s\n", ok ? "German locale from the installed definitions" : "no German locale");
  return ok ? 0 : 1;
}
