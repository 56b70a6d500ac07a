// The PNG bytes of the picture set, built into the library from the files
// in widgets/resources/pictures (see embed.cmake).
#pragma once

#include <cstddef>

namespace velm::resources {

struct EmbeddedPicture {
    const char *name; // the handle's name without "Img_"
    const unsigned char *bytes;
    std::size_t size;
};

// One kPicture<name> per picture; a picture without its PNG file fails to link.
#define VELM_PICTURE(name) extern const EmbeddedPicture kPicture##name;
#include "widgets/resources/picturelist.h"
#undef VELM_PICTURE

} // namespace velm::resources
