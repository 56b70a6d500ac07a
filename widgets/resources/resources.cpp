// The exported picture handles and their one-time loading.
#include "widgets/resources/velmresources.h"

#include "outside/base/blbase.h"
#include "widgets/resources/picturedata.h"

#include <iterator>

#define VELM_PICTURE(name) VELMCANVASIMAGE Img_##name = nullptr;
#include "widgets/resources/picturelist.h"
#undef VELM_PICTURE

namespace {

struct Slot {
    VELMCANVASIMAGE *handle;
    const velm::resources::EmbeddedPicture *picture;
};

const Slot kSlots[] = {
#define VELM_PICTURE(name) {&Img_##name, &velm::resources::kPicture##name},
#include "widgets/resources/picturelist.h"
#undef VELM_PICTURE
};

} // namespace

// Runs on the user-interface thread, like every canvas call, so the handles
// need no lock.
int VELMRESOURCES_Load(void)
{
    int missing = 0;
    for (const Slot &slot : kSlots) {
        if (!*slot.handle) {
            *slot.handle = VELMCANVAS_LoadImageQT(slot.picture->bytes, static_cast<int64_t>(slot.picture->size));
        }
        if (!*slot.handle) ++missing;
    }
    if (missing > 0) {
        BLDEBUG_Warning(-1, "VELMRESOURCES_Load: Unable to load %d of %d pictures", missing,
                        static_cast<int>(std::size(kSlots)));
    }
    return missing == 0;
}
