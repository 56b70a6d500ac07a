/* The shell's key and button bits turned into the library's pointer and key
 * flags (0x20 primary button, 0x40/0x10 other buttons, 0x02 add, 0x08 extend,
 * 0x04 region-to-selection, 0x80 zoom-box modifier). */
#ifndef VELMACCKEYS_H
#define VELMACCKEYS_H

#include <stdint.h>

#include "core/velm_api.h"

VELM_EXTERN_C_BEGIN

VELM_API uint32_t VELMDEFINES_TranslateAccKeys(uint32_t keys);
VELM_API uint32_t VELMAUDIO_TranslateAccKeys(uint32_t keys);

VELM_EXTERN_C_END

#endif /* VELMACCKEYS_H */
