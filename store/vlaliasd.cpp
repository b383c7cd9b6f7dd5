#include "store/store.h"

int VLDestroyAliasList(VLObjManager *m) {
  if (!m) return 0;
  VLAlias *r = m->aliases;
  m->aliases = nullptr;
  while (r) {
    VLAlias *next = r->next;
    vl::release(r);
    r = next;
  }
  return 0;
}
