// The display record shared by the display's source files.
#ifndef VELM_DISPLAY_INTERNAL_HPP
#define VELM_DISPLAY_INTERNAL_HPP

#include <cstdint>
#include <string>

#include "core/velmconfig.h"
#include "core/velmtimer.h"
#include "outside/signal/audioformat.h"
#include "widgets/display/velmdisplay.h"

// Draw property of the document holding the horizontal scale kind.
constexpr int kUnitProperty = 5;
// Typed text is bounded like the fixed buffer it stands for.
constexpr std::size_t kEditTextMax = 1023;

enum Unit { kUnitSample = 0, kUnitTime = 1, kUnitFrame = 2, kUnitSampleView = 3, kUnitTimeView = 4, kUnitFrameView = 5 };

// Pointer area codes.
constexpr uint32_t kAreaFormat = 0x1;
constexpr uint32_t kAreaMsLabel = 0x2;
constexpr uint32_t kAreaHmsLabel = 0x4;
constexpr uint32_t kAreaSign = 0x8;
constexpr uint32_t kAreaSamples = 0x10;

// The values a draw depends on; the last drawn copy decides redraws.
struct Shown {
    int32_t status = 0;
    int64_t position = 0;
    int64_t edit_value = 0;
    uint32_t redraw_mark = 0;
    uint32_t editing = 0;
    int32_t rate = 8000, channels = 1, bits = 16;
    int32_t unit = kUnitTime;
    uint32_t options = 0;
    bool operator==(const Shown &) const = default;
};

struct Layout {
    _VELMRECT widget{}, digits{}, sign{}, hours{}, minutes{}, seconds{}, millis{}, samples{}, labels{}, format{};
};

struct _VELMDISPLAY {
    uint32_t powered = 1;
    uint32_t property[2] = {0, 0};
    Shown now, drawn;
    bool ever_drawn = false;
    VELMAUDIO doc = nullptr;
    VELMDISPLAYDRAWCONFIG config{};
    // Pointer: area code at press, whether a press is pending, and the hover area.
    uint32_t press_area = 0;
    bool pressed = false;
    uint32_t hover = 0;
    VELMTIMER blink = nullptr;
    std::string text;
    Layout layout;
};

int  display_is_sample_unit(int unit);
int  display_is_frame_unit(int unit);
bool display_has_doc(const _VELMDISPLAY *d);
void display_notify(uint32_t event);
// Point in rectangle.
bool display_inside(const _VELMRECT &r, int x, int y);
// Lays out the cells for the canvas size with the digit font selected.
void display_layout(VELMCANVAS canvas, _VELMDISPLAY *d, int width, int height);
void display_end_edit(_VELMDISPLAY *d, bool apply);

#endif
