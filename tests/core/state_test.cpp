#include "core/velmstate.h"

#include <gtest/gtest.h>

namespace {

struct StatePair : ::testing::Test {
    VELMSTATE *a = VELMSTATE_Create();
    VELMSTATE *b = VELMSTATE_Create();
    void SetUp() override
    {
        ASSERT_NE(a, nullptr);
        ASSERT_NE(b, nullptr);
        for (VELMSTATE *s : {a, b}) {
            s->viewBegin = 1000;
            s->viewEnd = 2000;
        }
    }
    void TearDown() override
    {
        VELMSTATE_Destroy(a);
        VELMSTATE_Destroy(b);
    }
    uint32_t eval() const { return VELMSTATE_EvalChanges(nullptr, a, b); }
};

VELMSELECTION *add(VELMSTATE *s, double begin, double end)
{
    VELMSELECTION **tail = &s->selections;
    while (*tail) tail = &(*tail)->next;
    auto *rec = static_cast<VELMSELECTION *>(BLMEM_New(s->pool, sizeof(VELMSELECTION)));
    rec->begin = begin;
    rec->end = end;
    *tail = rec;
    return rec;
}

} // namespace

TEST(State, CreateGivesTheInitialValues)
{
    VELMSTATE *s = VELMSTATE_Create();
    ASSERT_NE(s, nullptr);
    EXPECT_EQ(s->selectingKind, SELECTING_REPLACE);
    EXPECT_EQ(s->channelMask, 0xFFFFu);
    EXPECT_EQ(s->viewFlags, 0x1F1u);
    EXPECT_EQ(s->horzScaleKind, 1);
    EXPECT_EQ(s->recordStart, -1);
    EXPECT_EQ(s->navigatorHeight, 40);
    EXPECT_EQ(s->spectral.fftLength, 256);
    EXPECT_DOUBLE_EQ(s->spectral.dynamicRange, 110.0);
    EXPECT_EQ(s->spectral.windowType, 5);
    EXPECT_NE(s->spectral.colorScheme, nullptr);
    EXPECT_FLOAT_EQ(s->waveHeightFraction, 0.5f);
    EXPECT_EQ(s->tracks[3].minimumHeight, 24);
    EXPECT_EQ(s->tracks[3].backgroundAlpha, 0x66);
    VELMSTATE_Destroy(s);
}

TEST_F(StatePair, CursorMovesAloneChangeNothing)
{
    a->cursor.position = 1500;
    a->playCursor.position = 1700;
    EXPECT_EQ(eval(), 0u);
}

TEST_F(StatePair, WindowChangesAreClassified)
{
    a->viewBegin = 1100;
    a->viewEnd = 2100;
    EXPECT_EQ(eval(), 0x811u);
    a->viewBegin = 5000;
    a->viewEnd = 6000;
    EXPECT_EQ(eval(), 0x80000810u);
    a->viewBegin = 1000;
    a->viewEnd = 2500;
    EXPECT_EQ(eval(), 0x80000810u);
}

TEST_F(StatePair, ChannelMaskWinsOverEveryLayoutChange)
{
    a->channelMask = 0x1;
    a->waveHeightFraction = 0.7f;
    EXPECT_EQ(eval(), 0x80000008u);
}

TEST_F(StatePair, LayoutChangesReturnBeforeOverlays)
{
    a->waveHeightFraction = 0.3f;
    a->quickBox.width = 10;
    EXPECT_EQ(eval(), 0x80001418u);
    a->waveHeightFraction = b->waveHeightFraction;
    a->horzScaleKind = 0;
    EXPECT_EQ(eval(), 0x80000010u);
}

TEST_F(StatePair, SpectralSettingsCountOnlyWithTheSpectrogramShown)
{
    a->spectral.fftLength = 1024;
    a->viewFlags = b->viewFlags = 0x1F1 & ~0x2u;
    EXPECT_EQ(eval(), 0u);
    a->viewFlags = b->viewFlags = 0x1F3;
    EXPECT_EQ(eval(), 0x80000000u);
}

TEST_F(StatePair, SizeAndFlagChangesRebuildEverything)
{
    a->drawWidth = 640;
    EXPECT_EQ(eval(), 0x80001C18u);
    a->drawWidth = b->drawWidth;
    b->viewFlags |= 0x80000000u;
    a->viewFlags = b->viewFlags;
    EXPECT_EQ(eval(), 0x80001C18u);
    EXPECT_EQ(VELMSTATE_EvalChanges(nullptr, nullptr, b), 0x80001C18u);
}

TEST_F(StatePair, OverlayBitsGather)
{
    add(a, 1.0, 2.0);
    EXPECT_EQ(eval(), 0x4u);
    add(b, 1.0, 2.5);
    EXPECT_EQ(eval(), 0x4u);
    b->selections->end = 2.0;
    EXPECT_EQ(eval(), 0u);
    a->selecting.end = 3.0;
    a->vertSelectionStart = 0.5;
    EXPECT_EQ(eval(), 0x2u | 0x4000u);
    a->selecting.end = b->selecting.end;
    a->vertSelectionStart = b->vertSelectionStart;
    a->recordStart = 10;
    a->recordPosition = 20;
    EXPECT_EQ(eval(), 0x80000020u);
    b->recordStart = 10;
    b->recordPosition = 15;
    EXPECT_EQ(eval(), 0x20u);
}

TEST_F(StatePair, FocusedRegionChanges)
{
    int region = 0, other = 0;
    a->focusedRegion.region = b->focusedRegion.region = &region;
    a->focusedRegion.flags = b->focusedRegion.flags = 0x2; // track 2
    a->focusedRegion.begin = 1.0;
    EXPECT_EQ(eval(), 0x80u);
    a->focusedRegion.flags = b->focusedRegion.flags = 0x0; // track 0
    EXPECT_EQ(eval(), 0xC0u);
    a->focusedRegion.begin = b->focusedRegion.begin;
    a->focusedRegion.length = 2.0;
    EXPECT_EQ(eval(), 0x140u);
    a->focusedRegion.region = &other;
    EXPECT_EQ(eval(), 0x40u);
}

TEST_F(StatePair, CustomTrackDisplayChanges)
{
    a->tracks[2].backgroundColor = 0x123456;
    EXPECT_EQ(eval(), 0x2000u);
    a->tracks[2].visible = 1;
    EXPECT_EQ(eval(), 0x80001C18u | 0x2000u);
}

TEST(StateCopy, CopyLaysSelectionsOutBehindTheRecord)
{
    VELMSTATE *s = VELMSTATE_Create();
    add(s, 0.5, 1.0);
    add(s, 2.0, 3.0);
    s->cursor.position = 77;
    VELMSTATE *copy = VELMSTATE_CreateCopy(nullptr, s);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(copy->ownsPool, 1);
    EXPECT_NE(copy->pool, s->pool);
    EXPECT_EQ(copy->cursor.position, 77);
    ASSERT_NE(copy->selections, nullptr);
    EXPECT_EQ(static_cast<void *>(copy->selections), static_cast<void *>(copy + 1));
    EXPECT_DOUBLE_EQ(copy->selections->next->begin, 2.0);
    EXPECT_EQ(copy->selections->next->next, nullptr);
    EXPECT_EQ(VELMSTATE_EvalChanges(nullptr, copy, s), 0u);
    VELMSTATE_Destroy(s);
    EXPECT_DOUBLE_EQ(copy->selections->end, 1.0); // the copy does not share the source's pool
    VELMSTATE_Destroy(copy);
}

TEST(StateCopy, AssignKeepsDisplayConfigurationAndPlayCursor)
{
    VELMSTATE *live = VELMSTATE_Create();
    live->drawWidth = 800;
    live->drawHeight = 600;
    live->playCursor.position = 4242;
    live->horzScaleKind = 4;
    VELMSTATE *snapshot = VELMSTATE_CreateCopy(nullptr, live);
    snapshot->drawWidth = 100;
    snapshot->playCursor.position = 1;
    snapshot->horzScaleKind = 0;
    snapshot->viewBegin = 10;
    snapshot->viewEnd = 90;
    add(snapshot, 0.25, 0.5);

    ASSERT_EQ(VELMSTATE_Assign(snapshot, &live), 1);
    EXPECT_EQ(live->drawWidth, 800);
    EXPECT_EQ(live->playCursor.position, 4242);
    EXPECT_EQ(live->horzScaleKind, 4);
    EXPECT_EQ(live->viewBegin, 10);
    EXPECT_EQ(live->viewEnd, 90);
    ASSERT_NE(live->selections, nullptr);
    EXPECT_DOUBLE_EQ(live->selections->begin, 0.25);
    EXPECT_EQ(VELMSTATE_Assign(nullptr, &live), 0);
    VELMSTATE_Destroy(snapshot);
    VELMSTATE_Destroy(live);
}

TEST(StateSelections, InvertCollectsTheGaps)
{
    VELMSTATE *s = VELMSTATE_Create();
    add(s, 0.0, 2.0);
    s = VELMSTATE_InvertSelection(s, 10.0);
    ASSERT_NE(s->selections, nullptr);
    EXPECT_DOUBLE_EQ(s->selections->begin, 2.0);
    EXPECT_DOUBLE_EQ(s->selections->end, 10.0);
    EXPECT_EQ(s->selections->next, nullptr);

    s = VELMSTATE_ClearSelection(s);
    EXPECT_EQ(s->selections, nullptr);
    add(s, 3.0, 10.0);
    s = VELMSTATE_InvertSelection(s, 10.0);
    EXPECT_DOUBLE_EQ(s->selections->begin, 0.0);
    EXPECT_DOUBLE_EQ(s->selections->end, 3.0);
    EXPECT_EQ(s->selections->next, nullptr);

    s = VELMSTATE_ClearSelection(s);
    add(s, 1.0, 2.0);
    add(s, 4.0, 5.0);
    s = VELMSTATE_InvertSelection(s, 6.0);
    double expected[][2] = {{0, 1}, {2, 4}, {5, 6}};
    int i = 0;
    for (VELMSELECTION *r = s->selections; r; r = r->next, ++i) {
        ASSERT_LT(i, 3);
        EXPECT_DOUBLE_EQ(r->begin, expected[i][0]);
        EXPECT_DOUBLE_EQ(r->end, expected[i][1]);
    }
    EXPECT_EQ(i, 3);
    VELMSTATE_Destroy(s);
}

TEST(StateNulls, NullArgumentsGiveFailureValues)
{
    EXPECT_EQ(VELMSTATE_CreateCopy(nullptr, nullptr), nullptr);
    EXPECT_EQ(VELMSTATE_ClearSelection(nullptr), nullptr);
    EXPECT_EQ(VELMSTATE_InvertSelection(nullptr, 1.0), nullptr);
    EXPECT_EQ(VELMSTATE_NotifyChanges(nullptr, 0), 0);
    EXPECT_EQ(VELMSTATE_ResetChanges(nullptr), 0);
    EXPECT_EQ(VELMSTATE_ResetVisualChanges(nullptr), 0);
    EXPECT_EQ(VELMSTATE_SelectionSize(nullptr, nullptr), 0);
    VELMSTATE_Destroy(nullptr);
}
