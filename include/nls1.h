/* Veltrin service layer: the NLS1_ interface. Compiles as C11 and as C++. */
#ifndef NLS1_H
#define NLS1_H

#include "veltrin.h"

#ifdef __cplusplus
extern "C" {
#endif

#ifdef __cplusplus
}
#endif

#endif /* NLS1_H */
