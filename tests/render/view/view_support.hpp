// Drawing documents onto offscreen Qt canvases, and golden-image comparison.
#ifndef VELM_TESTS_VIEW_SUPPORT_HPP
#define VELM_TESTS_VIEW_SUPPORT_HPP

#include <QImage>
#include <string>
#include <vector>

#include "core/velmaudio.h"
#include "render/view/velmdraw.h"

namespace viewtest {

// Makes the process's QGuiApplication once.
void ensure_application();

// Interleaved frames of a speech-like sound: voiced bursts with a gliding
// pitch and a few formant-like partials, separated by pauses.
std::vector<float> speech_like(int rate, int channels, double seconds);

// A Qt canvas of the given size; destroyed with the holder.
class Canvas {
public:
    Canvas(int width, int height);
    ~Canvas();
    Canvas(const Canvas &) = delete;
    Canvas &operator=(const Canvas &) = delete;
    VELMCANVAS get() const { return canvas_; }
    // VELMAUDIO_Draw between the host's begin and end of painting.
    int draw(VELMAUDIO doc, _VELMRECT *changed = nullptr);
    // The output target as an image.
    QImage output() const;

private:
    VELMCANVAS canvas_;
};

// Opens a WAV file written from frames; null on failure.
VELMAUDIO open_audio(const std::string &path, const std::vector<float> &frames, int rate, int channels);

// Compares image with golden/<name>.png: at most `budget` pixels may differ
// by more than `tolerance` in a channel.  VELM_UPDATE_GOLDEN=1 rewrites the
// golden image; a mismatch leaves <name>.actual.png and <name>.diff.png
// beside the test binary.  Returns an empty text on success.
std::string compare_golden(const QImage &image, const std::string &name, int tolerance = 24, double budget = 0.002);

// Number of pixels that differ at all between two images of one size.
long count_differences(const QImage &a, const QImage &b);

} // namespace viewtest

#endif
