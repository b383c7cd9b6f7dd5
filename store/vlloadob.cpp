// Loads an object's file under the global lock; a broken file is replaced by the
// built-in body of its type unless the manager forbids it.
#include "codepage/cpbody.h"
#include "store/store.h"

VL_TRACE_MODULE("vlloadob");

namespace {

struct Loaded {
  void *section[4] = {};
  uint32_t size[4] = {};
  uint8_t flags = 0;  // 0x02.. for sections the library allocated itself

  void releaseAll() {
    for (int i = 0; i < 4; ++i) {
      if (flags & (0x02 << i))
        vl::release(section[i]);
      else
        VLUnloadFile(section[i]);
      section[i] = nullptr;
    }
  }
};

uint32_t readObject(VLObjManager *m, VLObjEntry *e, Loaded *out) {
  char name[300];
  if (!VLGetDataFileName(m->directory, e->type, e->id, name, sizeof name)) return VL_RC_FILE_IO;
  uint32_t rc = 0;
  e->file = VLOpenFile(vlglobals ? vlglobals->fileContext : 0, name, VL_FILE_READ, 1, &rc);
  if (!e->file) {
    // The open's own reason is traced; a load reports every unopenable file alike, but
    // running out of memory stays passing (see below).
    VL_ERR("Unable to open %s, err = %d", name, static_cast<int>(rc));
    return rc == VL_RC_NOMEM ? rc : VL_RC_FILE_IO;
  }
  vl::Block<uint8_t> raw(static_cast<uint8_t *>(VLLoadFile(e->file, 0, vl::store::kHeaderSize, &rc)));
  if (!raw) return rc ? rc : VL_RC_FILE_IO;
  vl::store::Header h;
  if (!vl::store::parseHeader(raw.get(), &h)) {
    VL_ERR("Bad header in %s", name);
    return VL_RC_BADMAGIC;
  }
  for (int i = 0; i < h.count; ++i) {
    out->section[i] = VLLoadFile(e->file, h.offset[i], h.size[i], &rc);
    if (!out->section[i] && rc) return rc;
    out->size[i] = h.size[i];
  }
  if (e->type == VL_OBJ_CODEPAGE && vl::store::generation(h) == 1) {
    if (out->size[0] < vl::cp::kV1Header) return VL_RC_BADMAGIC;
    void *trie = nullptr;
    void *body = VLCpV1toV2(out->section[0], out->size[0], out->section[1], out->size[1], &trie, e);
    if (!body) return VL_RC_NOMEM;
    VLUnloadFile(out->section[0]);
    VLUnloadFile(out->section[1]);
    out->section[0] = body;
    out->section[1] = trie;
    out->size[0] = e->sectionSize[0];  // the upgrade records the new sizes in the entry
    out->size[1] = trie ? e->sectionSize[1] : 0;
    out->flags |= trie ? 0x06 : 0x02;
  }
  return 0;
}

}  // namespace

VLObjEntry *VLLoadObj(VLObjManager *m, VLObjEntry *e, uint32_t *rcOut) {
  VL_FLOW("VLLoadObj");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  if (!m || !e) {
    *rc = VL_RC_NOTFOUND;
    VL_RET(static_cast<VLObjEntry *>(nullptr));
  }
  if (__atomic_load_n(&e->section[0], __ATOMIC_ACQUIRE)) VL_RET(e);
  vl::LockGuard lock(vlglobals ? &vlglobals->lock : nullptr);
  if (e->section[0]) VL_RET(e);
  // Everything is read, upgraded, checked and byte-swapped in a private copy of the entry;
  // the shared entry changes only once the object is complete, and its body pointer is
  // stored last so that the lock-free lookups never see a half-checked object.
  Loaded l;
  VLObjEntry priv = *e;
  uint32_t code = readObject(m, &priv, &l);
  if (code == 0) {
    for (int i = 0; i < 4; ++i) {
      priv.section[i] = l.section[i];
      priv.sectionSize[i] = l.size[i];
    }
    code = vl::store::checkObject(&priv);
  }
  e->file = priv.file;
  if (code == 0) {
    e->flags = static_cast<uint8_t>((e->flags & 0x01) | l.flags);
    for (int i = 0; i < 4; ++i) e->sectionSize[i] = priv.sectionSize[i];
    for (int i = 3; i >= 1; --i) e->section[i] = l.section[i];
    __atomic_store_n(&e->section[0], l.section[0], __ATOMIC_RELEASE);
    VL_RET(e);
  }
  l.releaseAll();
  if (e->file) {
    VLCloseFile(e->file, 0);
    e->file = nullptr;
  }
  *rc = code;
  VL_ERR("Unable to load object type %d id %d, rc = %d", e->type, e->id, static_cast<int>(code));
  // Running out of memory is passing: the entry stays unloaded so that a later call can
  // load it, rather than being tied to the built-in body for the rest of the process.
  if (code != VL_RC_NOMEM && !m->noBuiltinFallback && VLLoadDefaultObj(m, e) == 0) VL_RET(e);
  VL_RET(static_cast<VLObjEntry *>(nullptr));
}
