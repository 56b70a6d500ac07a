// Text forms of scale kinds, window types and colour schemes.
#include <cstring>

#include "core/velmconfig.h"
#include "render/canvas/velmcanvas.h"

namespace {

struct Name {
    int value;
    const char *text;
};

// The first text of a value is its encoding.
const Name kHorzKinds[] = {{0, "sample"}, {0, "smpl"}, {1, "time"}, {2, "frame"}, {2, "frm"},
                           {3, "sample_view"}, {3, "smpl_view"}, {4, "time_view"}, {5, "frame_view"},
                           {5, "frm_view"}};
const Name kVertKinds[] = {{0, "sample"}, {0, "smpl"}, {0, "smp"}, {0, "sample_value"}, {1, "db"},
                           {2, "percentual"}, {2, "perc"}, {2, "%"}, {3, "normalized"}, {3, "norm"}};
const Name kSpecKinds[] = {{0, "hz"}, {0, "hertz"}, {1, "mels"}, {1, "mel"}};
const Name kWinTypes[] = {{0, "rectangular"}, {1, "triangular"}, {3, "hanning"}, {4, "hamming"},
                          {5, "blackman"}, {6, "blackman-harris"}, {7, "blackman-nuttall"}};

template <size_t N>
int decode(const Name (&names)[N], const char *text, int fallback)
{
    if (!text) return fallback;
    for (const Name &n : names)
        if (std::strcmp(n.text, text) == 0) return n.value;
    return fallback;
}

template <size_t N>
const char *encode(const Name (&names)[N], int value)
{
    for (const Name &n : names)
        if (n.value == value) return n.text;
    return "undef";
}

struct MapName {
    const VELMCOLORMAP *map;
    const char *text;
};

const MapName kColorSchemes[] = {
    {&VELMCOLORMAP_CE2K, "ce2k"},
    {&VELMCOLORMAP_INVLINEARGRAYSCALE, "invlineargrayscale"},
    {&VELMCOLORMAP_LINEARGRAYSCALE, "lineargrayscale"},
    {&VELMCOLORMAP_GRAYSCALE, "grayscale"},
    {&VELMCOLORMAP_INVGRAYSCALE, "invgrayscale"},
};

} // namespace

const char *VELMCONFIG_EncodeWinType(int value)
{
    if (value == 2 || value > 7) return "blackman";
    return encode(kWinTypes, value);
}

int VELMCONFIG_DecodeWinType(const char *text, int default_value)
{
    return decode(kWinTypes, text, default_value);
}

const char *VELMCONFIG_EncodeHorzScaleKind(int value)
{
    return encode(kHorzKinds, value);
}

int VELMCONFIG_DecodeHorzScaleKind(const char *text, int default_value)
{
    return decode(kHorzKinds, text, default_value);
}

const char *VELMCONFIG_EncodeVertScaleKind(int value)
{
    return encode(kVertKinds, value);
}

int VELMCONFIG_DecodeVertScaleKind(const char *text, int default_value)
{
    return decode(kVertKinds, text, default_value);
}

const char *VELMCONFIG_EncodeSpecScaleKind(int value)
{
    return encode(kSpecKinds, value);
}

int VELMCONFIG_DecodeSpecScaleKind(const char *text, int default_value)
{
    return decode(kSpecKinds, text, default_value);
}

const char *VELMCONFIG_EncodeColorScheme(const VELMCOLORMAP *colormap)
{
    for (const MapName &m : kColorSchemes)
        if (m.map == colormap) return m.text;
    return "undef";
}

const VELMCOLORMAP *VELMCONFIG_DecodeColorScheme(const char *text, const VELMCOLORMAP *default_map)
{
    if (!text) return default_map;
    for (const MapName &m : kColorSchemes)
        if (std::strcmp(m.text, text) == 0) return m.map;
    return default_map;
}
