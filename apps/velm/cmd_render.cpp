// velm render: draws the audio view of a sound into a PNG file.
#include <QGuiApplication>
#include <QImage>
#include <QPainter>
#include <QPixmap>
#include <QSaveFile>
#include <cstdio>
#include <future>
#include <memory>

#include "apps/velm/render_args.hpp"
#include "apps/velm/tool.hpp"
#include "core/velmconfig.h"
#include "core/velmnavigation.h"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"
#include "edit/velmcustomtrack.h"
#include "edit/velmregion.h"
#include "edit/velmselection.h"
#include "outside/base/blbase.h"
#include "render/canvas/velmcanvas.h"
#include "render/view/velmdraw.h"

namespace {

using velmtool::RenderArgs;

const char kUsage[] =
    "usage: velm render [FILE] -o OUT.png [--size WxH] [--lanes waveform|spectrogram|both]\n"
    "                   [--from SECONDS] [--to SECONDS] [--select FROM:TO ...] [--cursor SECONDS]\n"
    "                   [--regions FILE] [--horz-scale KIND] [--vert-scale KIND] [--spectral-scale KIND]\n"
    "                   [--set libvelm.KEY=VALUE ...] [--verbose]\n"
    "  --select FROM:TO       select FROM .. TO seconds; repeat to select more ranges\n"
    "  --cursor SECONDS       put the edit cursor there\n"
    "  --regions FILE         draw the regions of FILE (label text, region file or WAV cues)\n"
    "  --horz-scale KIND      sample, time, frame, sample_view, time_view or frame_view\n"
    "  --vert-scale KIND      sample, db, percentual or normalized\n"
    "  --spectral-scale KIND  hz or mels\n"
    "  --verbose              say on standard error what the document holds before drawing\n";

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
// The view is opaque, so the picture goes without an alpha channel; and
// with zlib's fast level: compressing a dense picture was half of a short
// sound's render; the fast level halves that for about a third more bytes.
bool save_png(const QImage &image, const char *path)
{
    constexpr int kFastCompression = 80;
    QSaveFile file(QString::fromLocal8Bit(path));
    return file.open(QIODevice::WriteOnly) &&
           image.convertToFormat(QImage::Format_RGB32).save(&file, "PNG", kFastCompression) && file.commit();
}

// Puts the regions, selections, cursor and scale kinds into the document;
// false after a message when one of them does not fit the sound.
bool mark_up(VELMAUDIO doc, const RenderArgs &args)
{
    if (args.regions && !VELMAUDIO_ReadRegions(doc, args.regions, "AUTO")) {
        std::fprintf(stderr, "velm: cannot read the regions in '%s': %s\n", args.regions,
                     velmtool::why(args.regions, false, AUDIOSIGNAL_GetLastError()).c_str());
        return false;
    }
    // Regions read from a file land on the default track, drawn under the
    // lanes with their labels.
    if (args.regions) {
        VELMAUDIO_ChangeSetting(doc, "libvelm.customtrack.default.options=SHOWRGNLABEL");
        VELMAUDIO_ShowCustomTrack(doc, "default");
    }
    for (const char *text : args.selections) {
        double from = 0, to = 0;
        int64_t begin = 0, end = 0;
        velmtool::parse_range(text, &from, &to);
        if (!velmtool::sample_range(doc, from, to, &begin, &end) || !VELMAUDIO_AddSelection(doc, begin, end)) {
            std::fprintf(stderr, "velm: the selection %s holds no samples\n", text);
            return false;
        }
    }
    if (args.cursor >= 0) {
        const int64_t sample = VELMAUDIO_TimeToSample(doc, args.cursor);
        if (sample > VELMAUDIO_NumSamples(doc)) {
            std::fprintf(stderr, "velm: the cursor at %g s is past the end of the sound\n", args.cursor);
            return false;
        }
        // False only when the cursor is there already.
        VELMAUDIO_SetCursorPosition(doc, sample);
    }
    for (const auto &[property, kind] : args.scales)
        if (!VELMAUDIO_SetDrawProperty(doc, property, kind)) {
            std::fprintf(stderr, "velm: cannot set the scale kind\n");
            return false;
        }
    if (args.verbose)
        std::fprintf(stderr, "velm: %d regions, %d selections\n",
                     VELMAUDIO_CountVisibleRegions(doc, 0, 0, 0, 0, nullptr), VELMAUDIO_SelectionChunkCount(doc));
    return true;
}

// Sets up the view of the opened sound and draws it; needs the application.
int render(const RenderArgs &args, VELMAUDIO opened)
{
    std::unique_ptr<_VELMAUDIO, CloseDocument> doc(opened);
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
    if (!mark_up(doc.get(), args)) return 1;
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
        std::fprintf(stderr, "velm: cannot write '%s': %s\n", args.out, velmtool::why(args.out, true, AUDIO_ERROR_NONE).c_str());
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
    const auto option = [&args](const char *text, const char *value) { return take_render_argument(&args, text, value); };
    if (!walk_arguments(argc, argv, option, &bad) || !args.out) return decline(argc, argv, bad, kUsage);
    for (const char *setting : args.settings) BLSETTINGS_ChangeEx(nullptr, "%s", setting);

    // The tool draws without a display unless the caller names a platform.
    if (qEnvironmentVariableIsEmpty("QT_QPA_PLATFORM")) qputenv("QT_QPA_PLATFORM", "offscreen");
    // Qt reads its own options from the arguments; it gets none of the tool's.
    int qt_argc = 1;
    char name[] = "velm";
    char *qt_argv[] = {name, nullptr};
    qInstallMessageHandler(qt_messages);
    // Opening reads the whole sound and needs nothing of Qt, so it runs while
    // Qt starts up (fonts, platform), which takes about as long as a minute
    // of sound takes to open.
    std::future<VELMAUDIO> opening = std::async(std::launch::async, [&args] { return open_input(args.file); });
    QGuiApplication application(qt_argc, qt_argv);
    return render(args, opening.get());
}

} // namespace velmtool
