// The exported colour maps: constant data, built at compile time.
#include "render/canvas/velmcanvas.h"

#include <array>
#include <cstdint>

namespace {

using Levels = std::array<std::uint8_t, 256>;

// floor(255 * (i / 255)^1.8): a grey ramp that gives weak values more room.
constexpr Levels kGammaLevels = {
      0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   0,   1,   1,   1,   1,
      1,   1,   2,   2,   2,   2,   3,   3,   3,   3,   4,   4,   4,   5,   5,   5,
      6,   6,   6,   7,   7,   7,   8,   8,   9,   9,   9,  10,  10,  11,  11,  12,
     12,  13,  13,  14,  14,  15,  15,  16,  16,  17,  17,  18,  18,  19,  20,  20,
     21,  21,  22,  22,  23,  24,  24,  25,  26,  26,  27,  28,  28,  29,  30,  30,
     31,  32,  33,  33,  34,  35,  36,  36,  37,  38,  39,  39,  40,  41,  42,  43,
     43,  44,  45,  46,  47,  48,  49,  49,  50,  51,  52,  53,  54,  55,  56,  57,
     57,  58,  59,  60,  61,  62,  63,  64,  65,  66,  67,  68,  69,  70,  71,  72,
     73,  74,  75,  76,  77,  79,  80,  81,  82,  83,  84,  85,  86,  87,  88,  90,
     91,  92,  93,  94,  95,  96,  98,  99, 100, 101, 102, 104, 105, 106, 107, 108,
    110, 111, 112, 113, 115, 116, 117, 119, 120, 121, 122, 124, 125, 126, 128, 129,
    130, 132, 133, 134, 136, 137, 138, 140, 141, 143, 144, 145, 147, 148, 150, 151,
    153, 154, 155, 157, 158, 160, 161, 163, 164, 166, 167, 169, 170, 172, 173, 175,
    176, 178, 179, 181, 182, 184, 185, 187, 189, 190, 192, 193, 195, 197, 198, 200,
    201, 203, 205, 206, 208, 210, 211, 213, 215, 216, 218, 220, 221, 223, 225, 226,
    228, 230, 232, 233, 235, 237, 239, 240, 242, 244, 246, 247, 249, 251, 253, 255,
};

// The heat ramp's fixed points (every sixteenth entry and the last); the
// entries between are interpolated linearly.
struct Anchor {
    int index;
    std::uint32_t rgb;
};
constexpr std::array<Anchor, 17> kHeatAnchors = {{
    {0, 0x000000},   {16, 0x01091B},  {32, 0x010323},  {48, 0x090130},  {64, 0x1C0140},
    {80, 0x380252},  {96, 0x610269},  {112, 0x84026E}, {128, 0xA00360}, {144, 0xC20344},
    {160, 0xE60519}, {176, 0xFB2F13}, {192, 0xFD8A3D}, {208, 0xFDC968}, {224, 0xFEF399},
    {240, 0xF7FEC6}, {255, 0xF8FEEB},
}};

constexpr unsigned char Channel(std::uint32_t rgb, int shift)
{
    return static_cast<unsigned char>((rgb >> shift) & 0xFF);
}

constexpr unsigned char Blend(unsigned char a, unsigned char b, int step, int steps)
{
    // Rounded to the nearest level.
    return static_cast<unsigned char>((a * (steps - step) + b * step + steps / 2) / steps);
}

constexpr VELMCOLORMAP MakeHeatMap()
{
    VELMCOLORMAP map{};
    for (std::size_t k = 0; k + 1 < kHeatAnchors.size(); ++k) {
        const Anchor from = kHeatAnchors[k], to = kHeatAnchors[k + 1];
        const int steps = to.index - from.index;
        for (int step = 0; step <= steps; ++step) {
            map.entry[from.index + step] = {Blend(Channel(from.rgb, 16), Channel(to.rgb, 16), step, steps),
                                            Blend(Channel(from.rgb, 8), Channel(to.rgb, 8), step, steps),
                                            Blend(Channel(from.rgb, 0), Channel(to.rgb, 0), step, steps), 0};
        }
    }
    return map;
}

template <typename Rule>
constexpr VELMCOLORMAP MakeGreyMap(Rule rule, unsigned char spare)
{
    VELMCOLORMAP map{};
    for (int i = 0; i < 256; ++i) {
        const unsigned char g = rule(i);
        map.entry[i] = {g, g, g, spare};
    }
    return map;
}

} // namespace

constinit const VELMCOLORMAP VELMCOLORMAP_CE2K = MakeHeatMap();
constinit const VELMCOLORMAP VELMCOLORMAP_GRAYSCALE =
    MakeGreyMap([](int i) { return kGammaLevels[i]; }, 0);
constinit const VELMCOLORMAP VELMCOLORMAP_INVGRAYSCALE =
    MakeGreyMap([](int i) { return kGammaLevels[255 - i]; }, 0);
constinit const VELMCOLORMAP VELMCOLORMAP_LINEARGRAYSCALE =
    MakeGreyMap([](int i) { return static_cast<unsigned char>(i); }, 0);
constinit const VELMCOLORMAP VELMCOLORMAP_INVLINEARGRAYSCALE =
    MakeGreyMap([](int i) { return static_cast<unsigned char>(255 - i); }, 255);
