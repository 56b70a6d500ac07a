// velm render: draws the audio view of a sound into a PNG file.
#include <QGuiApplication>
#include <QImage>
#include <QPainter>
#include <QPixmap>
#include <QSaveFile>
#include <cstdio>
#include <cstring>
#include <memory>
#include <string>
#include <vector>

#include "apps/velm/tool.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "outside/base/blbase.h"
#include "render/canvas/velmcanvas.h"
#include "render/view/velmdraw.h"

namespace {

const char kUsage[] =
    "usage: velm render [FILE] -o OUT.png [--size WxH] [--lanes waveform|spectrogram|both]\n"
    "                   [--from SECONDS] [--to SECONDS] [--set libvelm.KEY=VALUE ...]\n";

// Three pixmaps of this size are held at once, so the bound keeps a
// mistyped size from asking for gigabytes.
constexpr long kMaxWidth = 8192;
constexpr long kMaxHeight = 4096;
constexpr long kMinSide = 64;

struct RenderArgs {
    const char *file = nullptr;
    const char *out = nullptr;
    int width = 1200;
    int height = 400;
    uint32_t lanes = 3;
    double from = -1.0;
    double to = -1.0;
    std::vector<const char *> settings;
};

bool parse_size(const char *text, RenderArgs *args)
{
    const char *x = std::strchr(text, 'x');
    if (!x) return false;
    const std::string width(text, x);
    long w = 0, h = 0;
    if (!velmtool::parse_count(width.c_str(), kMinSide, kMaxWidth, &w) ||
        !velmtool::parse_count(x + 1, kMinSide, kMaxHeight, &h))
        return false;
    args->width = static_cast<int>(w);
    args->height = static_cast<int>(h);
    return true;
}

bool parse_lanes(const char *text, uint32_t *lanes)
{
    const char *names[] = {"waveform", "spectrogram", "both"};
    for (uint32_t kind = 1; kind <= 3; ++kind)
        if (std::strcmp(text, names[kind - 1]) == 0) {
            *lanes = kind;
            return true;
        }
    return false;
}

// A "libvelm." key with a name and a value sign; the value may be empty.
bool is_setting(const char *text)
{
    static const char prefix[] = "libvelm.";
    const size_t n = sizeof prefix - 1;
    const char *equals = std::strchr(text, '=');
    return std::strncmp(text, prefix, n) == 0 && equals && equals > text + n;
}

velmtool::Took take(RenderArgs *args, const char *option, const char *value)
{
    using velmtool::Took;
    using velmtool::value_if;
    if (option[0] != '-') return velmtool::word_into(&args->file, option);
    if (!value) return Took::Nothing;
    if (std::strcmp(option, "-o") == 0) {
        args->out = value;
        return Took::Value;
    }
    if (std::strcmp(option, "--size") == 0) return value_if(parse_size(value, args));
    if (std::strcmp(option, "--lanes") == 0) return value_if(parse_lanes(value, &args->lanes));
    if (std::strcmp(option, "--from") == 0) return value_if(velmtool::parse_seconds(value, &args->from));
    if (std::strcmp(option, "--to") == 0) return value_if(velmtool::parse_seconds(value, &args->to));
    if (std::strcmp(option, "--set") == 0) {
        args->settings.push_back(value);
        return value_if(is_setting(value));
    }
    return Took::Nothing;
}

struct CloseDocument {
    void operator()(_VELMAUDIO *doc) const { VELMAUDIO_Close(doc); }
};
struct DestroyCanvas {
    void operator()(_VELMCANVAS *canvas) const { VELMCANVAS_DestroyCanvas(canvas); }
};

// Qt's own notes (such as a missing runtime folder on the offscreen
// platform) are not the tool's messages; only its errors are shown.
void qt_messages(QtMsgType type, const QMessageLogContext &, const QString &text)
{
    if (type == QtCriticalMsg || type == QtFatalMsg) std::fprintf(stderr, "velm: %s\n", qPrintable(text));
}

// Written through a temporary file, so a failed write leaves OUT as it was.
bool save_png(const QImage &image, const char *path)
{
    QSaveFile file(QString::fromLocal8Bit(path));
    return file.open(QIODevice::WriteOnly) && image.save(&file, "PNG") && file.commit();
}

// Opens the sound, sets up its view and draws it; needs the application.
int render(const RenderArgs &args)
{
    std::unique_ptr<_VELMAUDIO, CloseDocument> doc(velmtool::open_input(args.file));
    if (!doc) return 1;
    VELMAUDIO_SetDrawKindOption(doc.get(), args.lanes);
    if (args.from >= 0 || args.to >= 0) {
        int64_t begin = 0, end = 0;
        if (!velmtool::sample_range(doc.get(), args.from, args.to, &begin, &end) ||
            !VELMAUDIO_Zoom(doc.get(), begin, end)) {
            std::fprintf(stderr, "velm: the range holds no samples\n");
            return 1;
        }
    }
    std::unique_ptr<_VELMCANVAS, DestroyCanvas> canvas(VELMCANVAS_CreateCanvasQT(nullptr, args.width, args.height));
    if (!canvas || !VELMCANVAS_ResizeCanvas(canvas.get(), args.width, args.height)) {
        std::fprintf(stderr, "velm: cannot make a %dx%d canvas\n", args.width, args.height);
        return 1;
    }
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas.get(), &painter);
    const int drawn = VELMAUDIO_Draw(canvas.get(), doc.get(), nullptr);
    VELMCANVAS_EndDraw(canvas.get());
    if (!drawn) {
        std::fprintf(stderr, "velm: the view could not be drawn\n");
        return 1;
    }
    // The output pixmap may be larger than the canvas; keep the canvas's part.
    const auto *pixmap = static_cast<const QPixmap *>(VELMCANVAS_GetOutputHandle(canvas.get()));
    if (!pixmap || !save_png(pixmap->toImage().copy(0, 0, args.width, args.height), args.out)) {
        std::fprintf(stderr, "velm: cannot write '%s'\n", args.out);
        return 1;
    }
    return 0;
}

} // namespace

namespace velmtool {

int run_render(int argc, char **argv)
{
    RenderArgs args;
    const char *bad = nullptr;
    const auto option = [&args](const char *text, const char *value) { return take(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad) || !args.out) return decline(argc, argv, bad, kUsage);
    for (const char *setting : args.settings) BLSETTINGS_ChangeEx(nullptr, "%s", setting);

    // The tool draws without a display unless the caller names a platform.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
    // Qt reads its own options from the arguments; it gets none of the tool's.
    int qt_argc = 1;
    char name[] = "velm";
    char *qt_argv[] = {name, nullptr};
    qInstallMessageHandler(qt_messages);
    QGuiApplication application(qt_argc, qt_argv);
    return render(args);
}

} // namespace velmtool
