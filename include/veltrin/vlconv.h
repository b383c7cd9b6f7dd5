/* Part of the Veltrin interface; include <veltrin.h>.
   Conversion between code pages, UTF-16 and the W form: one-shot and streaming. */
#ifndef VELTRIN_VLCONV_H
#define VELTRIN_VLCONV_H

#ifdef __cplusplus
extern "C" {
#endif

/* A streaming conversion: the caller holds it from VLOpenConversion to
   VLCloseConversion. Between calls of VLConvertBuffer it keeps the bytes of a
   character not yet complete, output that did not fit, and both shift states. */
typedef struct VLConversion {
  VLLocale *source;
  uint8_t pendingIn[5];
  uint8_t sourceState;
  uint8_t pendingInCount;
  VLLocale *target;
  uint8_t pendingOut[5];
  uint8_t targetState;
  uint8_t pendingOutCount;
} VLConversion;

VL_API VLConversion *VLOpenConversion(VLLocale *target, VLLocale *source);
VL_API uint32_t VLCloseConversion(VLConversion *conversion);
/* 0: all input consumed and delivered; 52: output full, the rest is held;
   53: input ended inside a character, its bytes are held. */
VL_API uint32_t VLConvertBuffer(VLConversion *conversion, unsigned char **out, uint32_t *outLeft,
                                const unsigned char **in, uint32_t *inLeft, uint32_t reserved);
VL_API int32_t VLConversionRatio(VLLocale *target, VLLocale *source);

VL_API int32_t VLConvertString(VLLocale *target, char *out, int32_t outSize, VLLocale *source,
                               const char *in, int32_t inLength, uint32_t options);
VL_API int32_t VLConvertStringEx(VLLocale *target, char *out, VLShiftState targetState,
                                 int32_t outSize, VLLocale *source, const char *in,
                                 VLShiftState sourceState, int32_t inLength, uint32_t options);
VL_API int32_t VLConvertStringW(VLLocale *target, VLWChar *out, int32_t outCount, VLLocale *source,
                                const VLWChar *in, int32_t inCount, uint32_t options);

VL_API int32_t VLMbToWide(VLLocale *locale, VLWChar *out, int32_t outCount, const char *in,
                          int32_t inLength, uint32_t options);
VL_API int32_t VLMbToWideEx(VLLocale *locale, VLWChar *out, int32_t outCount, const char *in,
                            VLShiftState state, int32_t inLength, uint32_t options);
VL_API int32_t VLWideToMb(VLLocale *locale, char *out, int32_t outSize, const VLWChar *in,
                          int32_t inCount, uint32_t options);
VL_API int32_t VLWideToMbEx(VLLocale *locale, char *out, VLShiftState state, int32_t outSize,
                            const VLWChar *in, int32_t inCount, uint32_t options);

VL_API int32_t VLStringToUnicode(VLUChar *out, int32_t outCount, VLLocale *locale, const char *in,
                                 int32_t inLength, uint32_t options);
VL_API int32_t VLStringToUnicodeW(VLUChar *out, int32_t outCount, VLLocale *locale,
                                  const VLWChar *in, int32_t inCount, uint32_t options);
VL_API int32_t VLStringToUnicodeEx(VLUChar *out, int32_t outCount, VLLocale *locale, const char *in,
                                   VLShiftState state, int32_t inLength, uint32_t options);
VL_API int32_t VLUnicodeToString(VLLocale *locale, char *out, int32_t outSize, const VLUChar *in,
                                 int32_t inLength, uint32_t options);
VL_API int32_t VLUnicodeToStringW(VLLocale *locale, VLWChar *out, int32_t outCount,
                                  const VLUChar *in, int32_t inLength, uint32_t options);
VL_API int32_t VLUnicodeToStringEx(VLLocale *locale, char *out, VLShiftState state, int32_t outSize,
                                   const VLUChar *in, int32_t inLength, uint32_t options);

#ifdef __cplusplus
}
#endif

#endif
