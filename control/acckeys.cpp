// Translation of the shell's key and button bits into the library's flags.
#include "control/velmacckeys.h"

#include "render/canvas/velmcanvas.h"

namespace {

struct KeyMap {
    uint32_t shell;
    uint32_t library;
};

const KeyMap kKeys[] = {
    {0x01, 0x20}, {0x02, 0x80}, {0x04, 0x08}, {0x08, 0x02}, {0x10, 0x40}, {0x20, 0x04 | 0x01}, {0x40, 0x01},
};

} // namespace

uint32_t VELMDEFINES_TranslateAccKeys(uint32_t keys)
{
    uint32_t flags = 0;
    for (const KeyMap &k : kKeys)
        if (keys & k.shell) flags |= k.library;
    return flags;
}

uint32_t VELMAUDIO_TranslateAccKeys(uint32_t keys)
{
    return VELMCANVAS_TranslateAccKeys(keys);
}
