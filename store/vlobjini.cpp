// Creates the object manager: finds and reads the control file, or falls back to the
// built-in objects.
#include "store/store.h"

VL_TRACE_MODULE("vlobjini");

namespace {

constexpr int kNameSize = 256;

// Tries to open directory/control.nls; false (stop looking) when the name cannot be built
// (rc 1003) or memory ran out.
bool openControl(const char *dir, VLFile **file, uint32_t *rc) {
  char name[kNameSize];
  if (!VLGetControlFileName(dir, name, kNameSize)) {
    *rc = VL_RC_FILE_IO;
    VL_ERR("Unable to construct control file name in directory %s", dir);
    VL_ERR("control size = %d", kNameSize);
    return false;
  }
  uint32_t orc = 0;
  *file = VLOpenFile(vlglobals ? vlglobals->fileContext : 0, name, VL_FILE_READ, 1, &orc);
  if (!*file) {
    *rc = orc;
    VL_ERR("Unable to open %s, err = %d", name, static_cast<int>(orc));
  }
  // Out of memory is not a reason to look elsewhere.
  return orc != VL_RC_NOMEM;
}

// Derives the per-type ranges from a table sorted by type.
void deriveRanges(VLObjManager *m, uint16_t count) {
  uint8_t prev = 0;
  m->typeStart[0] = 0;
  for (uint16_t i = 0; i < count; ++i) {
    uint8_t t = m->entries[i].type;
    if (t != prev) {
      for (int k = prev + 1; k <= t; ++k) m->typeStart[k] = i;
      prev = t;
    }
  }
  for (int k = prev + 1; k <= 4; ++k) m->typeStart[k] = count;
}

// Reads the table of an open control file into the manager.
uint32_t readTable(VLObjManager *m, VLFile *file) {
  uint8_t raw[vl::store::kHeaderSize];
  uint32_t rc = 0;
  int32_t n = VLReadFile(file, raw, sizeof raw, &rc);
  vl::store::Header h;
  if (rc || n != static_cast<int32_t>(sizeof raw)) return VL_RC_FILE_IO;
  if (!vl::store::parseHeader(raw, &h)) {
    VL_ERR("Control file header is corrupted");
    return VL_RC_BADMAGIC;
  }
  uint32_t count = h.size[0] / vl::store::kDiskRecord;
  vl::Block<uint8_t> buf(h.size[0] ? h.size[0] : 1);
  if (!buf) {
    VL_ERR("Unable to allocate %d bytes for control data", h.size[0]);
    return VL_RC_NOMEM;
  }
  VL_DETAIL("VLObjDisk size = %d", 38);
  size_t bytes = sizeof(VLObjEntry) * (count ? count : 1);
  vl::Block<VLObjEntry> entries(bytes);
  if (!entries) {
    VL_ERR("Unable to allocate %d bytes for control data", static_cast<int>(bytes));
    return VL_RC_NOMEM;
  }
  std::memset(entries.get(), 0, bytes);
  if (h.offset[0] > 0x7FFFFFFFu || VLSeekFile(file, static_cast<int32_t>(h.offset[0]), VL_SEEK_SET) != 0) {
    VL_ERR("Seek to offset %d failed for file %p", static_cast<int>(h.offset[0]), static_cast<void *>(file));
    return VL_RC_FILE_IO;
  }
  n = VLReadFile(file, buf.get(), h.size[0], &rc);
  if (rc || n != h.size[0]) {
    VL_ERR("Read of %d bytes from file %p failed with error %d", h.size[0], static_cast<void *>(file),
           static_cast<int>(rc));
    return VL_RC_FILE_IO;
  }
  for (uint32_t i = 0; i < count; ++i) {
    const uint8_t *r = buf.get() + i * vl::store::kDiskRecord;
    VLObjEntry *e = entries.get() + i;
    e->id = vl::be16(r);
    e->type = r[2];
    e->flags = 0;
    std::memcpy(e->name, r + 4, 34);
    e->name[33] = 0;
    // The ranges and the binary search rely on the order; a table out of order is corrupt.
    if (e->type > 3 || r[3] != 0) return VL_RC_BADMAGIC;
    if (i > 0) {
      const VLObjEntry *p = e - 1;
      if (p->type > e->type || (p->type == e->type && p->id >= e->id)) return VL_RC_BADMAGIC;
    }
    VL_DETAIL("Entry = %d, Object Type = %d, Object Id = %d, Object Name = %s", static_cast<int>(i), e->type, e->id,
              e->name);
  }
  m->entries = entries.take();
  deriveRanges(m, static_cast<uint16_t>(count));
  return 0;
}

}  // namespace

VLObjManager *VLInitObjManager(const char *directory, uint32_t options, uint32_t *rcOut) {
  VL_FLOW("VLInitObjManager");
  uint32_t dummy;
  uint32_t *rc = rcOut ? rcOut : &dummy;
  *rc = 0;
  vl::Block<VLObjManager> m(sizeof(VLObjManager));
  if (!m) {
    VL_ERR("Unable to allocate %d bytes for object manager", static_cast<int>(sizeof(VLObjManager)));
    *rc = VL_RC_NOMEM;
    VL_RET(static_cast<VLObjManager *>(nullptr));
  }
  std::memset(m.get(), 0, sizeof(VLObjManager));
  m->noBuiltinFallback = options == VL_OPT_NOBUILTIN;
  if (directory)
    VL_DETAIL("directory = %s.", directory);
  else
    VL_DETAIL("No directory specified");
  VL_DETAIL("options = %d", static_cast<int>(options));

  VLFile *file = nullptr;
  const char *used = nullptr;
  bool tryMore = true;
  if (directory) {
    tryMore = openControl(directory, &file, rc);
    if (file) used = directory;
  }
  if (!file && tryMore) {
    int n = VLGetDataLocation(m->directory, sizeof m->directory, 0);
    if (n == 0) {
      *rc = VL_RC_FILE_IO;
      tryMore = false;
    } else if (n > 0) {
      tryMore = openControl(m->directory, &file, rc);
      if (file) used = m->directory;
    }
  }
  if (!file && tryMore) {
    char loc[32];
    if (VLGetDataLocation(loc, sizeof loc, 1) > 0 && openControl(loc, &file, rc) && file) {
      std::memcpy(m->directory, loc, std::strlen(loc) + 1);
      used = m->directory;
    } else if (!file && *rc == 0) {
      *rc = VL_RC_FILE_IO;
    }
  }
  if (file) {
    if (used != m->directory) {
      size_t n = std::strlen(used);
      std::memcpy(m->directory, used, n + 1);  // fits: the control name was built from it
    }
    *rc = readTable(m.get(), file);
    if (*rc == 0 && VLBuildAliasList(m.get()) != 0) VL_ERR("Alias list build failed. No aliases supported");
    if (*rc != 0 && m->entries) {
      vl::release(m->entries);
      m->entries = nullptr;
    }
    VLCloseFile(file, 0);
  } else {
    VL_ERR("Unable to open control file");
    if (*rc == 0) *rc = VL_RC_FILE_IO;
  }
  if (*rc == VL_RC_NOMEM) {
    VLDestroyAliasList(m.get());
    VL_RET(static_cast<VLObjManager *>(nullptr));
  }
  if (*rc != 0 && options != VL_OPT_NOBUILTIN) {
    VLDestroyAliasList(m.get());
    if (!VLLoadDefaults(m.get())) {
      *rc = VL_RC_NOMEM;
      VL_RET(static_cast<VLObjManager *>(nullptr));
    }
  }
  VL_RET(m.take());
}
