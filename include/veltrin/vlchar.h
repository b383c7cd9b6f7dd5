/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLCHAR_H
#define VELTRIN_VLCHAR_H

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif
