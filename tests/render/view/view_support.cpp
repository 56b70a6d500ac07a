#include "view_support.hpp"

#include <QGuiApplication>
#include <QPainter>
#include <QPixmap>
#include <cmath>
#include <cstdlib>
#include <filesystem>

#include "testaudio.hpp"

namespace viewtest {

void ensure_application()
{
    static int argc = 1;
    static char name[] = "test_render_view";
    static char *argv[] = {name, nullptr};
    if (!QGuiApplication::instance()) new QGuiApplication(argc, argv);
}

std::vector<float> speech_like(int rate, int channels, double seconds)
{
    const auto frames = static_cast<int64_t>(seconds * rate);
    std::vector<float> out(static_cast<size_t>(frames * channels));
    double phase = 0.0;
    for (int64_t i = 0; i < frames; ++i) {
        const double t = static_cast<double>(i) / rate;
        // Syllables of 0.25 s with 0.1 s pauses.
        const double cycle = std::fmod(t, 0.35);
        const double envelope = cycle < 0.25 ? std::sin(M_PI * cycle / 0.25) : 0.0;
        const double pitch = 120.0 + 60.0 * std::sin(2.0 * M_PI * 0.7 * t);
        phase += 2.0 * M_PI * pitch / rate;
        double v = 0.0;
        for (int h = 1; h <= 12; ++h) {
            const double f = h * pitch;
            const double formant = std::exp(-std::pow((f - 700.0) / 300.0, 2)) + 0.5 * std::exp(-std::pow((f - 1800.0) / 400.0, 2));
            v += (0.15 + formant) / h * std::sin(h * phase);
        }
        for (int c = 0; c < channels; ++c)
            out[static_cast<size_t>(i * channels + c)] = static_cast<float>(0.45 * envelope * v * (1.0 - 0.12 * c));
    }
    return out;
}

Canvas::Canvas(int width, int height)
{
    ensure_application();
    canvas_ = VELMCANVAS_CreateCanvasQT(nullptr, width, height);
    // A host sizes its canvas before the first paint.
    VELMCANVAS_ResizeCanvas(canvas_, width, height);
}

Canvas::~Canvas()
{
    VELMCANVAS_DestroyCanvas(canvas_);
}

int Canvas::draw(VELMAUDIO doc, _VELMRECT *changed)
{
    QPainter painter;
    VELMCANVAS_BeginDraw(canvas_, &painter);
    const int result = VELMAUDIO_Draw(canvas_, doc, changed);
    VELMCANVAS_EndDraw(canvas_);
    return result;
}

QImage Canvas::output() const
{
    const auto *pixmap = static_cast<const QPixmap *>(VELMCANVAS_GetOutputHandle(canvas_));
    int width = 0, height = 0;
    VELMCANVAS_GetDimension(canvas_, &width, &height);
    return pixmap ? pixmap->toImage().copy(0, 0, width, height).convertToFormat(QImage::Format_RGB32) : QImage();
}

VELMAUDIO open_audio(const std::string &path, const std::vector<float> &frames, int rate, int channels)
{
    if (!velmtest::write_audio(path, frames, rate, channels)) return nullptr;
    return VELMAUDIO_Open(path.c_str(), "AUTO");
}

long count_differences(const QImage &a, const QImage &b)
{
    if (a.size() != b.size()) return -1;
    long n = 0;
    for (int y = 0; y < a.height(); ++y)
        for (int x = 0; x < a.width(); ++x) n += a.pixel(x, y) != b.pixel(x, y);
    return n;
}

std::string compare_golden(const QImage &image, const std::string &name, int tolerance, double budget)
{
    const std::string golden = std::string(VELM_GOLDEN_DIR) + "/" + name + ".png";
    const char *update = std::getenv("VELM_UPDATE_GOLDEN");
    if (update && std::string(update) == "1") {
        std::filesystem::create_directories(VELM_GOLDEN_DIR);
        return image.save(QString::fromStdString(golden)) ? "" : "cannot write " + golden;
    }
    const QImage expected = QImage(QString::fromStdString(golden)).convertToFormat(QImage::Format_RGB32);
    if (expected.isNull()) return "missing golden image " + golden;
    if (expected.size() != image.size()) return "size differs from " + golden;
    QImage diff(image.size(), QImage::Format_RGB32);
    long bad = 0;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x) {
            const QRgb a = image.pixel(x, y), b = expected.pixel(x, y);
            const int d = std::max({std::abs(qRed(a) - qRed(b)), std::abs(qGreen(a) - qGreen(b)), std::abs(qBlue(a) - qBlue(b))});
            bad += d > tolerance;
            diff.setPixel(x, y, d > tolerance ? qRgb(255, 0, 0) : qRgb(d * 4, d * 4, d * 4));
        }
    if (bad <= static_cast<long>(budget * image.width() * image.height())) return "";
    const std::string base = std::string(VELM_TEST_BINARY_DIR) + "/" + name;
    image.save(QString::fromStdString(base + ".actual.png"));
    diff.save(QString::fromStdString(base + ".diff.png"));
    return std::to_string(bad) + " pixels differ from " + golden + "; see " + base + ".actual.png";
}

} // namespace viewtest
