/* Part of the Veltrin interface; include <veltrin.h>.
   Message catalogs: numbered texts in numbered sets, found through path templates. */
#ifndef VELTRIN_VLCATALOG_H
#define VELTRIN_VLCATALOG_H

#ifdef __cplusplus
extern "C" {
#endif

#define VL_RC_CAT_NULL    70u /* null catalog given to VLCloseCatalog */
#define VL_RC_CAT_INVALID 71u /* catalog not found, or not a valid catalog file */
#define VL_RC_CAT_NOMSG   72u /* message not found and no default text */

/* VLOpenCatalog options. */
#define VL_CAT_ONEPASS  0x80000060u /* the given locale only, no second pass */
#define VL_CAT_INMEMORY 0x80000061u /* one pass, and the whole catalog loaded at open */

/* The catalog file: a 152-byte header, then set records, indexes and text blocks;
   integers in the byte order of the host that wrote it. */
#define VL_CAT_MAGIC      0x476cf463u
#define VL_CAT_VERSION    0x10000000u
#define VL_CAT_HEADER     152u
#define VL_CAT_SETRECORD  28u
#define VL_CAT_INDEXENTRY 12u
#define VL_CAT_LOCALENAME 132u

/* One message of a set loaded into memory. */
typedef struct VLMcMsg {
  uint32_t number;
  uint32_t length;       /* bytes before the first 0 */
  const char *text;      /* 0-terminated, inside the set's text copy */
} VLMcMsg;

/* A set record as the file holds it; loaded sets also point at their own copies of the
   message index and the text block. */
typedef struct VLMcSet {
  uint32_t number;
  uint32_t next;         /* offset of the next set record, 0 for the last */
  uint32_t count;        /* messages */
  uint32_t indexOffset;
  uint32_t textOffset;
  uint32_t textSize;
  uint32_t reserved;
  VLMcMsg *index;        /* in-memory mode */
  char *text;            /* in-memory mode */
} VLMcSet;

typedef struct VLCatalog {
  void *image;           /* in-memory mode: the file while it is loaded */
  uint32_t size;
  VLMcSet *sets;         /* in-memory mode, ascending set numbers */
  uint32_t setCount;
  uint32_t firstSet;     /* file mode: offset of the first set record, 0 until checked */
  VLLocale *locale;      /* the caller's: messages are converted into its code page */
  VLLocale *catLocale;   /* the catalog's, from its header */
  VLFile *file;
  uint8_t inMemory;
} VLCatalog;

VL_API VLCatalog *VLOpenCatalog(VLLocale *locale, const char *pathTemplate, const char *name, uint32_t options);
VL_API VLCatalog *VLOpenCatalogW(VLLocale *locale, const VLWChar *pathTemplate, const VLWChar *name,
                                 uint32_t options);
VL_API VLCatalog *VLOpenCatalogU(VLLocale *locale, const VLUChar *pathTemplate, const VLUChar *name,
                                 uint32_t options);
/* 0, or 72 when the message is missing and no default text was given (the code of a
   damaged catalog otherwise). */
VL_API uint32_t VLGetMessage(VLCatalog *catalog, uint32_t set, uint32_t message, char *buffer, int32_t length,
                             const char *defaultText, uint32_t unused);
VL_API uint32_t VLGetMessageW(VLCatalog *catalog, uint32_t set, uint32_t message, VLWChar *buffer, int32_t length,
                              const VLWChar *defaultText, uint32_t unused);
VL_API uint32_t VLGetMessageU(VLCatalog *catalog, uint32_t set, uint32_t message, VLUChar *buffer, int32_t length,
                              const VLUChar *defaultText, uint32_t unused);
VL_API uint32_t VLCloseCatalog(VLCatalog *catalog);

/* Internals of the family, exported for tools built on it. */
VL_API VLMcSet *MCGetSet(VLCatalog *catalog, uint32_t set, VLMcSet *buffer);
/* File mode: a copy the caller frees with VLMcFree; in-memory mode: inside the set. */
VL_API char *MCGetMsg(VLCatalog *catalog, VLMcSet *set, uint32_t message);
VL_API VLCatalog *VLMcLoadCat(VLLocale *locale, VLFile *file, uint32_t options);
VL_API VLMcSet *VLMcLoadSet(VLCatalog *catalog, VLMcSet *set);
VL_API int VLMcGetByteOrder(void);
VL_API void *VLMcMalloc(size_t size);
VL_API void VLMcFree(void *block);
VL_API void *VLMcRealloc(void *block, size_t oldSize, size_t newSize);
VL_API void *VLMcSetZero(void *block, size_t size);
VL_API void *VLMcMemcpy(void *to, const void *from, size_t size);

#ifdef __cplusplus
}
#endif

#endif
