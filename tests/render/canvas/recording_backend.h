// A canvas back-end for tests: all 57 slots record their calls as text, so a
// test can see exactly what reached the table.  Text is 6 pixels a
// character wide and 10 high; images are FakeImage records.
#ifndef VELM_TEST_RECORDING_BACKEND_H
#define VELM_TEST_RECORDING_BACKEND_H

#include "render/canvas/velmcanvas.h"

#include <gtest/gtest.h>

#include <set>
#include <string>
#include <vector>

namespace velm::test {

struct FakeImage {
    const char *name;
    int width;
    int height;
};

inline VELMCANVASIMAGE AsImage(FakeImage &image)
{
    return reinterpret_cast<VELMCANVASIMAGE>(&image);
}

class Recorder {
public:
    Recorder();
    ~Recorder();

    // The table: every slot filled; tests may empty some.
    _VELMCANVASOPS ops{};
    // Every call, as "Name(arg,arg,...)", in order.
    std::vector<std::string> calls;
    // Slots named here answer 0 (or null).
    std::set<std::string> failing;
    int visible_width = 0;
    int visible_height = 0;
    float alpha_factor = 1.0f;

    // A canvas on this back-end, visible at the given size.
    VELMCANVAS MakeCanvas(int width, int height);
    // Calls whose text starts with the prefix.
    std::vector<std::string> CallsOf(const std::string &prefix) const;

    static Recorder *Current();
};

// A 400 x 200 canvas on a fresh recording back-end, no call recorded yet.
class RecordingCanvas : public ::testing::Test {
protected:
    void SetUp() override { canvas = rec.MakeCanvas(400, 200); }
    void TearDown() override { VELMCANVAS_DestroyCanvas(canvas); }

    Recorder rec;
    VELMCANVAS canvas = nullptr;
};

} // namespace velm::test

#endif // VELM_TEST_RECORDING_BACKEND_H
