/* The library's version. */
#ifndef VELMVERSION_H
#define VELMVERSION_H

#include "core/velm_api.h"

VELM_EXTERN_C_BEGIN

/* "libvelm version 2.6.0.2985 (built in <date>)", in a static buffer. */
VELM_API const char *VELMVERSION_String(void);
/* Writes each part into the out-parameters that are not null. */
VELM_API void VELMVERSION_Number(int *major, int *minor, int *release, int *build);

VELM_EXTERN_C_END

#endif /* VELMVERSION_H */
