/* Part of the Veltrin interface; include <veltrin.h>. */
#ifndef VELTRIN_VLINFO_H
#define VELTRIN_VLINFO_H

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif
