/* Part of the Veltrin interface; include <veltrin.h>.
   Native (platform) locale names, the user's locale, the default locale, enumeration. */
#ifndef VELTRIN_VLNATIVE_H
#define VELTRIN_VLNATIVE_H

#ifdef __cplusplus
extern "C" {
#endif

/* VLConvertNativeLocale options: 0x1 is passed on to VLMapNativeInfo, 0x4 falls back. */
#define VL_NATIVE_INFO     0x1u

/* Enumeration callbacks: (context, object type, name); returning 0 stops the walk. */
typedef int (*VLEnumCallback)(void *context, int type, const char *name);
typedef int (*VLEnumCallbackW)(void *context, int type, const VLWChar *name);
typedef int (*VLEnumCallbackU)(void *context, int type, const VLUChar *name);

/* The library locale name of a native name (or "Unknown"), cut to outSize - 1 bytes. */
VL_API char *VLMapNativeLocale(const char *native, char *out, int32_t outSize);
/* 1: from "VL_LANG"; 2: from the platform's locale; 0: the platform locale could not be saved. */
VL_API int VLGetUserLocale(char *out, int32_t outSize);
VL_API VLLocale *VLConvertNativeLocale(const char *native, uint32_t options, uint32_t *rc);
VL_API void VLMapNativeInfo(const char *native, VLLocale *locale, int unusedFlag);

/* Replace the default locale; the old one stays when the new one cannot be built. */
VL_API uint32_t VLSetLocale(const char *name, uint32_t options);
VL_API uint32_t VLSetLocaleW(const VLWChar *name, uint32_t options);
VL_API uint32_t VLSetLocaleU(const VLUChar *name, uint32_t options);

VL_API int VLEnumLocales(VLEnumCallback callback, void *context);
VL_API int VLEnumLocalesW(VLEnumCallbackW callback, void *context);
VL_API int VLEnumLocalesU(VLEnumCallbackU callback, void *context);

/* The native name of a handle's locale; 1 when one was written. */
VL_API int VLConvertLocale(VLLocale *locale, char *out, int32_t size);

#ifdef __cplusplus
}
#endif

#endif
