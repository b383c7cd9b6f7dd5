/* Veltrin globalisation library: the VL interface. Compiles as C11 and as C++. */
#ifndef VELTRIN_H
#define VELTRIN_H

#include <stddef.h>
#include <stdint.h>

#if defined(__GNUC__)
#define VL_API __attribute__((visibility("default")))
#else
#define VL_API
#endif

#ifdef __cplusplus
extern "C" {
#endif

/* ---- Return codes ------------------------------------------------------ */
#define VL_RC_OK               0u
#define VL_RC_OPEN             1u /* file could not be opened; a free failed in a release */
#define VL_RC_BADARG           2u /* invalid argument, option bits or selector */
#define VL_RC_DEFAULTS         10u /* initialised on the built-in definitions */
#define VL_RC_NOMANAGER        11u /* no object manager; object lookup failed otherwise */
#define VL_RC_NOMEM            20u
#define VL_RC_FREEFAIL         21u
#define VL_RC_NOCODEPAGE       30u
#define VL_RC_NOLANGUAGE       31u
#define VL_RC_NOSORT           33u
#define VL_RC_NOTERRITORY      34u
#define VL_RC_BADITEM          35u
#define VL_RC_NOSBCSPUNCT      36u
#define VL_RC_NOTFOUND         37u
#define VL_RC_BUFFER           40u
#define VL_RC_RADIX            50u
#define VL_RC_BADPATTERN       51u
#define VL_RC_CNV_FULL         52u
#define VL_RC_CNV_PARTIAL      53u
#define VL_RC_FILE_MISSING     1000u
#define VL_RC_FILE_ACCESS      1001u
#define VL_RC_FILE_WRITEONLY   1002u
#define VL_RC_FILE_IO          1003u
#define VL_RC_BADMAGIC         2000u

/* ---- Shared option bits -------------------------------------------------- */
#define VL_OPT_CHARLEN   0x4000u
#define VL_OPT_NULLTERM  0x0008u
#define VL_OPT_DEFAULTS  0x0001u
#define VL_OPT_NOBUILTIN 0x80000001u   /* VLInit: never substitute built-in objects */

/* VLGetLocale options */
#define VL_LOCALE_USER     0x2u
#define VL_LOCALE_FALLBACK 0x4u

/* Object types */
enum { VL_OBJ_LANGUAGE = 0, VL_OBJ_TERRITORY = 1, VL_OBJ_CODEPAGE = 2, VL_OBJ_SORT = 3 };

/* Locale handle flags */
#define VL_LF_SINGLEBYTE 0x0040u
#define VL_LF_BINARY     0x0080u
#define VL_LF_SHIFT      0x0100u

#define VL_CP_UTF8   57352u
#define VL_CP_ASCII  367u

/* ---- Types ---------------------------------------------------------------- */
typedef uint16_t VLUChar;        /* one UTF-16 unit */
typedef uint32_t VLWChar;        /* one code page character, bytes packed big-endian */
typedef uint32_t VLShiftState;   /* 0 single-byte state, 1 double-byte state */

typedef struct VLGlobals VLGlobals;
typedef struct VLObjManager VLObjManager;
typedef struct VLFile VLFile;
typedef struct VLAlias VLAlias;

/* One object of the definition store; the first 38 bytes mirror its control record. */
typedef struct VLObjEntry {
  uint16_t id;
  uint8_t type;
  uint8_t flags;            /* 0x01 built-in body; 0x02..0x10 section n allocated by the library */
  char name[34];
  VLFile *file;
  void *section[4];
  uint32_t sectionSize[4];  /* upgraded sections may exceed a file section */
} VLObjEntry;

/* A loaded code page is its object entry: section 0 body, 1 conversion trie,
   2 and 3 the Unicode-to-code-page low and high tables. */
typedef VLObjEntry VLCodePage;

/* The locale handle. */
typedef struct VLLocale {
  VLObjEntry *language;
  VLObjEntry *territory;
  VLObjEntry *codePage;
  VLObjEntry *sort;           /* null: binary order */
  uint32_t setMask;
  uint16_t num[3];            /* numeric precision, local and international fraction digits */
  uint16_t flags;
  uint8_t chars[8];           /* sign positions, then the five punctuation bytes */
  char *texts[8];
  uint16_t setMaskU;
  uint16_t wchars[5];
  VLUChar *textsU[8];
  int32_t lastError;
} VLLocale;

/* A type record of a code page: the type word and the case delta. */
typedef struct VLCtypeRecord {
  uint32_t type;
  int32_t caseDelta;
} VLCtypeRecord;

typedef void *(*VLAllocHook)(uint32_t context, size_t size);
typedef int (*VLFreeHook)(uint32_t context, void *block);

/* ---- Initialisation and memory ------------------------------------------- */
VL_API extern VLGlobals *vlglobals;
VL_API extern VLAllocHook vlalloc_cbk;
VL_API extern VLFreeHook vlfree_cbk;
VL_API extern VLLocale *vlglocale;
VL_API extern const void *const VLDefaultLanguage;
VL_API extern const void *const VLDefaultTerritory;
VL_API extern const void *const VLDefaultCodePage;
VL_API extern const void *const VLDefCP3;

VL_API uint32_t VLInit(const char *directory, VLAllocHook allocHook, VLFreeHook freeHook,
                       uint32_t allocContext, uint32_t options);
VL_API uint32_t VLTerm(void);
VL_API void *VLDefAlloc(uint32_t context, size_t size);
VL_API int VLDefFree(uint32_t context, void *block);
VL_API int32_t VLGetError(VLLocale *locale);

/* ---- Paths, environment and files ----------------------------------------- */
enum { VL_FILE_READ = 0, VL_FILE_WRITE = 1, VL_FILE_READWRITE = 2 };
enum { VL_SEEK_SET = 10, VL_SEEK_CUR = 11, VL_SEEK_END = 12 };

VL_API int SplitDrive(const char *path, char *out);
VL_API int SplitDir(const char *path, char *out);
VL_API int SplitFile(const char *path, char *out);
VL_API int SplitExtent(const char *path, char *out);
VL_API int SplitPath(const char *path, char *drive, char *dir, char *file, char *extent);
VL_API char *MakePath(char *out, const char *drive, const char *dir, const char *file,
                      const char *extent);

VL_API VLFile *VLOpenFile(uint32_t context, const char *name, int mode, int noTemp, uint32_t *rc);
VL_API int VLCloseFile(VLFile *file, int discard);
VL_API int32_t VLReadFile(VLFile *file, void *buffer, uint32_t length, uint32_t *rc);
VL_API int VLSeekFile(VLFile *file, int32_t offset, int origin);
VL_API void *VLLoadFile(VLFile *file, uint32_t offset, uint32_t size, uint32_t *rc);
VL_API int VLUnloadFile(void *block);
VL_API int64_t VLFileSize(VLFile *file);

VL_API int VLGetEnv(const char *name, char *buffer, int size);
VL_API int VLGetDataLocation(char *buffer, int size, int which);
VL_API char *VLGetControlFileName(const char *directory, char *buffer, int size);
VL_API char *VLGetDataFileName(const char *directory, int type, int id, char *buffer, int size);
VL_API int VLmemicmp(const void *a, const void *b, size_t length);

/* ---- Object manager ------------------------------------------------------------ */
VL_API VLObjManager *VLInitObjManager(const char *directory, uint32_t options, uint32_t *rc);
VL_API uint32_t VLTermObjManager(VLObjManager *manager);
VL_API VLObjEntry *VLGetObjFromName(VLObjManager *manager, uint16_t type, const char *name,
                                    int32_t length, int noLoad, uint32_t *rc);
VL_API VLObjEntry *VLGetObjFromNameW(VLObjManager *manager, uint16_t type, const VLWChar *name,
                                     int32_t length, int noLoad, uint32_t *rc);
VL_API VLObjEntry *VLGetObjFromID(VLObjManager *manager, uint16_t type, uint16_t id, int noLoad,
                                  uint32_t *rc);
VL_API VLObjEntry *VLLoadObj(VLObjManager *manager, VLObjEntry *entry, uint32_t *rc);
VL_API uint32_t VLUnloadObj(VLObjManager *manager, VLObjEntry *entry);
VL_API int VLLoadDefaultObj(VLObjManager *manager, VLObjEntry *entry);
VL_API int VLLoadDefaults(VLObjManager *manager);

/* ---- Code page aliases ------------------------------------------------------------ */
VL_API char *VLGetAliasFileName(const char *directory, char *buffer, int size);
VL_API int VLBuildAliasList(VLObjManager *manager);
VL_API const char *VLGetCodepageFromAlias(VLObjManager *manager, const char *name);
VL_API int VLDestroyAliasList(VLObjManager *manager);
VL_API int VLLangGetSpecial(const VLObjEntry *language, VLUChar first, VLUChar second,
                            VLUChar *out1, VLUChar *out2, int table);

/* ---- Locale handles -------------------------------------------------------------- */
VL_API VLLocale *VLGetLocale(const char *name, uint32_t options, uint32_t *rc);
VL_API VLLocale *VLGetLocaleW(const VLWChar *name, uint32_t options, uint32_t *rc);
VL_API VLLocale *VLGetLocaleU(const VLUChar *name, uint32_t options, uint32_t *rc);
VL_API uint32_t VLReleaseLocale(VLLocale *locale);
VL_API uint32_t VLLocaleSetModifiable(VLLocale *locale);
VL_API uint32_t VLLocaleChangeTerritory(VLLocale *locale, VLObjEntry *territory);
VL_API uint32_t VLLocaleChangeCodePage(VLLocale *locale, VLObjEntry *codePage);
VL_API void VLLocaleFreeOldText(const VLLocale *keep, const VLLocale *old);
VL_API int32_t VLLocaleCnvText(const VLCodePage *from, const VLCodePage *to, const char *text,
                               char *out);

/* ---- Code page primitives ------------------------------------------------------------ */
VL_API VLWChar VLMbToW(const VLCodePage *cp, const unsigned char *p);
VL_API VLWChar VLMbToWS(const VLCodePage *cp, const unsigned char *p, int shifted);
VL_API int VLWToMb(unsigned char *out, VLWChar value);
VL_API VLUChar VLCpMbToUnicode(const VLCodePage *cp, const unsigned char *p);
VL_API VLUChar VLCpMbToUnicodeW(const VLCodePage *cp, VLWChar value);
VL_API int VLCpUnicodeToChar(const VLCodePage *cp, VLUChar unit, unsigned char *out);
VL_API VLWChar VLCpUnicodeToCharW(const VLCodePage *cp, VLUChar unit);
VL_API const VLCtypeRecord *VLGetMbCtype(const VLCodePage *cp, const unsigned char *p);
VL_API const VLCtypeRecord *VLGetMbCtypeW(const VLCodePage *cp, VLWChar value);
VL_API int VLCpMbCaseConv(const VLCodePage *cp, const unsigned char *src, unsigned char *out,
                          uint32_t mask);
VL_API int VLCpMbCaseConvS(const VLCodePage *cp, const unsigned char *src, unsigned char *out,
                           uint32_t mask);
VL_API VLWChar VLCpMbCaseConvW(const VLCodePage *cp, VLWChar value, uint32_t mask);
VL_API VLWChar VLCpMbHalfToFullW(const VLCodePage *cp, VLWChar value);
VL_API VLWChar VLCpFullToHalfW(const VLCodePage *cp, VLWChar value);
VL_API int32_t VLCpStrToUnicode(const VLCodePage *cp, const unsigned char *s, int32_t length,
                                VLUChar *out);
VL_API int32_t VLCpUnicodeToStr(const VLCodePage *cp, const VLUChar *u, int32_t length,
                                VLShiftState state, unsigned char *out);
VL_API int32_t VLCpStrCharToByteLen(const VLCodePage *cp, const unsigned char *s,
                                    VLShiftState state, int32_t chars);
VL_API int32_t VLCpStrByteToCharLen(const VLCodePage *cp, const unsigned char *s,
                                    VLShiftState state, int32_t bytes);
VL_API int32_t VLComStrToUnicode(const unsigned char *s, uint32_t length, VLUChar *out);
VL_API int32_t VLComUnicodeToStr(const VLUChar *u, uint32_t length, unsigned char *out);
VL_API void *VLCpV1toV2(const void *body, uint32_t bodySize, const void *trie, uint32_t trieSize,
                        void **newTrie, VLCodePage *record);

#ifdef __cplusplus
}
#endif

/* Further families. */
#include "veltrin/vlchar.h"
#include "veltrin/vlstring.h"
#include "veltrin/vlcmp.h"
#include "veltrin/vlconv.h"
#include "veltrin/vlinfo.h"
#include "veltrin/vlnative.h"
#include "veltrin/vlstream.h"
#include "veltrin/vlcatalog.h"
#include "veltrin/vltime.h"
#include "veltrin/vlnum.h"
#include "veltrin/vlmap.h"
#include "veltrin/vlcoll.h"

#endif /* VELTRIN_H */
