// The quick box and the scale-range selections on a document's view state,
// and the notifications they send.
#include <climits>
#include <gtest/gtest.h>
#include <vector>

#include "control/velmcontrol.h"
#include "core/velmaudio.h"
#include "testaudio.hpp"

namespace {

struct Event {
    uint32_t code;
    int x, y;
};

int record(const BLNotifyEvent *e, void *user)
{
    auto *events = static_cast<std::vector<Event> *>(user);
    const bool points = e->event == 0x2002F;
    events->push_back({e->event, points ? *static_cast<int *>(e->data1) : -1, points ? *static_cast<int *>(e->data2) : -1});
    return 1;
}

class QuickBox : public ::testing::Test {
protected:
    void SetUp() override
    {
        const std::string path = dir.file("a.wav");
        ASSERT_TRUE(velmtest::write_audio(path, velmtest::sine(8000, 1, 8000), 8000, 1));
        doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        ASSERT_NE(doc, nullptr);
        ASSERT_TRUE(VELMAUDIO_AddEventHandler(doc, record, &events));
    }
    void TearDown() override { VELMAUDIO_Close(doc); }

    const VELMQUICKBOX &box() const { return VELMAUDIO_GetState(doc)->quickBox; }
    void expect_box(int x, int y, int width, int height, int corner_x, int corner_y) const
    {
        const VELMQUICKBOX &b = box();
        EXPECT_EQ(b.x, x);
        EXPECT_EQ(b.y, y);
        EXPECT_EQ(b.width, width);
        EXPECT_EQ(b.height, height);
        EXPECT_EQ(b.cornerX, corner_x);
        EXPECT_EQ(b.cornerY, corner_y);
    }
    size_t count(uint32_t code) const
    {
        size_t n = 0;
        for (const Event &e : events) n += e.code == code;
        return n;
    }

    velmtest::TempDir dir;
    VELMAUDIO doc = nullptr;
    std::vector<Event> events;
};

TEST_F(QuickBox, StartUpdateClear)
{
    ASSERT_TRUE(VELMAUDIO_StartQuickBox(doc, 120, 40));
    expect_box(120, 40, 0, 0, 120, 40);
    ASSERT_EQ(events.size(), 1u);
    EXPECT_EQ(events[0].code, 0x2002Fu);
    EXPECT_EQ(events[0].x, 120);
    EXPECT_EQ(events[0].y, 40);

    ASSERT_TRUE(VELMAUDIO_UpdateQuickBox(doc, 150, 90));
    expect_box(120, 40, 31, 51, 150, 90);
    EXPECT_EQ(count(0x20024), 1u);
    EXPECT_TRUE(VELMAUDIO_GetState(doc)->status & STATUS_VISUAL_CHANGED);

    // Dragged up and left of the origin the size turns negative.
    ASSERT_TRUE(VELMAUDIO_UpdateQuickBox(doc, 100, 30));
    expect_box(120, 40, -19, -9, 100, 30);
    ASSERT_TRUE(VELMAUDIO_UpdateQuickBox(doc, 120, 40));
    expect_box(120, 40, 1, 1, 120, 40);

    ASSERT_TRUE(VELMAUDIO_ClearQuickBox(doc));
    expect_box(0, 0, 0, 0, 0, 0);
    EXPECT_EQ(count(0x20030), 1u);
    EXPECT_EQ(count(0x20024), 4u);
    EXPECT_EQ(events.back().code, 0x20030u);
}

TEST_F(QuickBox, ExtremeCornersKeepTheSizeInRange)
{
    ASSERT_TRUE(VELMAUDIO_StartQuickBox(doc, INT_MIN, INT_MAX));
    ASSERT_TRUE(VELMAUDIO_UpdateQuickBox(doc, INT_MAX, INT_MIN));
    EXPECT_EQ(box().width, INT_MAX);
    EXPECT_EQ(box().height, INT_MIN);
}

TEST_F(QuickBox, ScaleRangeSelections)
{
    VELMSTATE *s = VELMAUDIO_GetState(doc);
    ASSERT_TRUE(VELMAUDIO_StartVerticalScaleSelection(doc, 0.25));
    EXPECT_EQ(s->vertSelectionStart, 0.25);
    EXPECT_EQ(s->vertSelectionEnd, 0.25);
    EXPECT_TRUE(events.empty());
    ASSERT_TRUE(VELMAUDIO_EndVerticalScaleSelection(doc, -0.5));
    EXPECT_EQ(s->vertSelectionStart, 0.25);
    EXPECT_EQ(s->vertSelectionEnd, -0.5);
    EXPECT_EQ(count(0x20024), 1u);

    ASSERT_TRUE(VELMAUDIO_StartSpecScaleSelection(doc, 1200.0));
    EXPECT_EQ(s->spectralSelectionStart, 1200.0);
    EXPECT_EQ(s->spectralSelectionEnd, 1200.0);
    EXPECT_EQ(count(0x20024), 1u);
    ASSERT_TRUE(VELMAUDIO_EndSpecScaleSelection(doc, 300.0));
    EXPECT_EQ(s->spectralSelectionStart, 1200.0);
    EXPECT_EQ(s->spectralSelectionEnd, 300.0);
    EXPECT_EQ(count(0x20024), 2u);
    // The vertical range is left alone by the spectral one.
    EXPECT_EQ(s->vertSelectionEnd, -0.5);
}

TEST(QuickBoxArguments, NullDocumentChangesNothing)
{
    EXPECT_EQ(VELMAUDIO_StartQuickBox(nullptr, 1, 2), 0);
    EXPECT_EQ(VELMAUDIO_UpdateQuickBox(nullptr, 1, 2), 0);
    EXPECT_EQ(VELMAUDIO_ClearQuickBox(nullptr), 0);
    EXPECT_EQ(VELMAUDIO_StartVerticalScaleSelection(nullptr, 1.0), 0);
    EXPECT_EQ(VELMAUDIO_EndVerticalScaleSelection(nullptr, 1.0), 0);
    EXPECT_EQ(VELMAUDIO_StartSpecScaleSelection(nullptr, 1.0), 0);
    EXPECT_EQ(VELMAUDIO_EndSpecScaleSelection(nullptr, 1.0), 0);
}

} // namespace
