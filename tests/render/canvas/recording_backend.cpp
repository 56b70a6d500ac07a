#include "render/canvas/recording_backend.h"

#include <cstdio>
#include <cstring>
#include <type_traits>

namespace velm::test {
namespace {

Recorder *g_current = nullptr;

std::string Format(int value)
{
    return std::to_string(value);
}

std::string Format(int64_t value)
{
    return std::to_string(value);
}

std::string Format(float value)
{
    char text[32];
    std::snprintf(text, sizeof text, "%g", value);
    return text;
}

std::string Format(uint32_t value)
{
    char text[16];
    std::snprintf(text, sizeof text, "0x%X", value);
    return text;
}

std::string Format(const char *text)
{
    return text ? std::string("\"") + text + "\"" : "null";
}

std::string Format(const _VELMRECT *rect)
{
    return "{" + Format(rect->left) + "," + Format(rect->top) + "," + Format(rect->width) + "," +
           Format(rect->height) + "}";
}

std::string Format(VELMCANVASIMAGE image)
{
    return reinterpret_cast<FakeImage *>(image)->name;
}

std::string Format(const VELMCOLORMAP *map)
{
    return map == &VELMCOLORMAP_CE2K ? "CE2K" : "map";
}

std::string Format(const _VELMCANVASFONT *font)
{
    return font->name;
}

std::string Format(const void *pointer)
{
    return pointer ? "ptr" : "null";
}

template <typename... Args>
std::string Describe(const char *name, Args... args)
{
    std::string text;
    ((text += ",", text += Format(args)), ...);
    return std::string(name) + "(" + (text.empty() ? text : text.substr(1)) + ")";
}

// Records the call and answers 1 (0 when the slot is set to fail).
template <typename Result, typename... Args>
Result Record(const char *name, Args... args)
{
    Recorder *r = g_current;
    r->calls.push_back(Describe(name, args...));
    const bool fails = r->failing.count(name) != 0;
    if constexpr (std::is_pointer_v<Result>) {
        return fails ? nullptr : reinterpret_cast<Result>(r);
    } else {
        return fails ? Result(0) : Result(1);
    }
}

template <typename Slot>
struct ResultOf;
template <typename R, typename... A>
struct ResultOf<R (*)(A...)> {
    using type = R;
};

// A slot that records its arguments after the back-end data.
#define RECORD(slot)                                                                               \
    ops.slot = [](_VELMCANVASDATA *, auto... args) -> ResultOf<decltype(_VELMCANVASOPS::slot)>::type {         \
        return Record<ResultOf<decltype(_VELMCANVASOPS::slot)>::type>(#slot, args...);                         \
    }
// A slot without a back-end data argument.
#define RECORD_NODATA(slot)                                                                        \
    ops.slot = [](auto... args) -> ResultOf<decltype(_VELMCANVASOPS::slot)>::type {                            \
        return Record<ResultOf<decltype(_VELMCANVASOPS::slot)>::type>(#slot, args...);                         \
    }

} // namespace

Recorder::Recorder()
{
    g_current = this;
    ops.CreateCanvas = [](void *, int width, int height) {
        return Record<_VELMCANVASDATA *>("CreateCanvas", width, height);
    };
    RECORD(GetOutputHandle);
    RECORD(GetDrawObject);
    RECORD(SetDrawObject);
    RECORD(SelectTarget);
    RECORD(BeginDraw);
    RECORD(EndDraw);
    RECORD(UseLowProfile);
    ops.ResizeCanvas = [](_VELMCANVASDATA *, int width, int height) {
        g_current->visible_width = width;
        g_current->visible_height = height;
        return Record<int>("ResizeCanvas", width, height);
    };
    RECORD(DestroyCanvas);
    RECORD(CopyCanvas);
    RECORD(InitPath);
    RECORD(ClosePath);
    RECORD(Clear);
    RECORD(ProtectDrawArea);
    RECORD(SetDrawArea);
    RECORD(ClearDrawArea);
    ops.GetDimension = [](_VELMCANVASDATA *, int *width, int *height) {
        *width = g_current->visible_width;
        *height = g_current->visible_height;
        return Record<int>("GetDimension");
    };
    ops.GetMaxDimension = [](_VELMCANVASDATA *, int *width, int *height) {
        *width = 4000;
        *height = 3000;
        return Record<int>("GetMaxDimension");
    };
    RECORD(DrawPoint);
    RECORD(MoveTo);
    RECORD(LineTo);
    ops.DrawPolygon = [](_VELMCANVASDATA *, const int *, const int *, int count, uint32_t fill) {
        return Record<int>("DrawPolygon", count, fill);
    };
    ops.DrawPolyline = [](_VELMCANVASDATA *, const int *, const int *, int count) {
        return Record<int>("DrawPolyline", count);
    };
    RECORD(DrawLine);
    RECORD(TextOut);
    RECORD(TextOutVertical);
    RECORD(SaveOverlay);
    RECORD(GetOverlayRect);
    RECORD(RestoreOverlay);
    RECORD(CreateImage);
    RECORD(CopyImage);
    RECORD(PasteImage);
    RECORD(PasteImageScaled);
    RECORD_NODATA(DestroyImage);
    ops.ImageWidth = [](VELMCANVASIMAGE image) {
        Record<int>("ImageWidth", image);
        return reinterpret_cast<FakeImage *>(image)->width;
    };
    ops.ImageHeight = [](VELMCANVASIMAGE image) {
        Record<int>("ImageHeight", image);
        return reinterpret_cast<FakeImage *>(image)->height;
    };
    ops.PutImage = [](_VELMCANVASDATA *, int x, int y, int width, int height, const void *, int image_width,
                      int image_height, int format, int source_x, int source_y, int source_width,
                      int source_height) {
        return Record<int>("PutImage", x, y, width, height, image_width, image_height, format, source_x, source_y,
                           source_width, source_height);
    };
    RECORD(FillRect);
    RECORD(BorderRect);
    RECORD(FillHorzGradientRect);
    RECORD(FillVertGradientRect);
    RECORD(ShadowRect);
    RECORD(SelectColor);
    RECORD(SelectColorMap);
    RECORD(SelectShadowColor);
    RECORD(SelectFont);
    RECORD(SelectFontColor);
    RECORD(SelectGradient);
    ops.SetAlphaFactor = [](_VELMCANVASDATA *, float factor) {
        Record<int>("SetAlphaFactor", factor);
        const float previous = g_current->alpha_factor;
        g_current->alpha_factor = factor;
        return previous;
    };
    RECORD(MoveBlock);
    RECORD(MoveBlock2);
    ops.TextWidth = [](_VELMCANVASDATA *, const char *text) {
        Record<int>("TextWidth", text);
        return 6 * static_cast<int>(std::strlen(text));
    };
    ops.TextHeight = [](_VELMCANVASDATA *, const char *text) {
        Record<int>("TextHeight", text);
        return 10;
    };
    RECORD(DrawAlphaRect);
    RECORD(DrawImage);
    ops.LoadImage = [](const void *, int64_t length) { return Record<VELMCANVASIMAGE>("LoadImage", length); };
}

Recorder::~Recorder()
{
    g_current = nullptr;
}

Recorder *Recorder::Current()
{
    return g_current;
}

VELMCANVAS Recorder::MakeCanvas(int width, int height)
{
    VELMCANVAS canvas = VELMCANVAS_CreateCanvas(&ops, nullptr, width, height);
    if (canvas) {
        visible_width = width;
        visible_height = height;
    }
    calls.clear();
    return canvas;
}

std::vector<std::string> Recorder::CallsOf(const std::string &prefix) const
{
    std::vector<std::string> found;
    for (const std::string &call : calls) {
        if (call.compare(0, prefix.size(), prefix) == 0) found.push_back(call);
    }
    return found;
}

} // namespace velm::test
