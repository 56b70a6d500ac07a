// A document's selection list and the selection being dragged.
#include "core/velmaudio.h"
#include "core/velmnavigation.h"
#include "edit/velmselection.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <limits>
#include <utility>
#include <vector>

namespace {

struct Counter {
    std::vector<uint32_t> codes;
    uint32_t veto = 0;
    static int handler(const BLNotifyEvent *e, void *user)
    {
        auto *c = static_cast<Counter *>(user);
        c->codes.push_back(e->event);
        return e->event == c->veto ? 0 : 1;
    }
    int count(uint32_t code) const
    {
        int n = 0;
        for (uint32_t c : codes) n += c == code;
        return n;
    }
};

// A 10 s document at 1 kHz: samples and milliseconds coincide.
struct Sel : ::testing::Test {
    Counter events; // outlives the document, which sends events while it closes
    VELMAUDIO doc = nullptr;
    void SetUp() override
    {
        const _audio_format f = AUDIO_InitFormat(1000, 1, 16);
        doc = VELMAUDIO_NewFromSignal(AUDIOSIGNAL_CreateSilence(&f, 10000), 0);
        ASSERT_NE(doc, nullptr);
    }
    void TearDown() override { VELMAUDIO_Close(doc); }
    std::vector<std::pair<int64_t, int64_t>> list() const
    {
        std::vector<std::pair<int64_t, int64_t>> out;
        for (int i = 0; i < VELMAUDIO_SelectionChunkCount(doc); ++i)
            out.emplace_back(VELMAUDIO_SelectionChunkBegin(doc, i), VELMAUDIO_SelectionChunkEnd(doc, i));
        return out;
    }
    using List = std::vector<std::pair<int64_t, int64_t>>;
};

} // namespace

TEST_F(Sel, EmptyRangesOnlyMoveTheCursor)
{
    VELMAUDIO_AddEventHandler(doc, Counter::handler, &events);
    EXPECT_TRUE(VELMAUDIO_AddSelection(doc, 20000, 12000));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 10000);
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    EXPECT_EQ(events.count(0x2000B), 0);
    EXPECT_EQ(VELMAUDIO_SelectionBegin(doc), -1);
    EXPECT_EQ(VELMAUDIO_SelectionEnd(doc), 0);
}

TEST_F(Sel, TouchingAndCoveringRangesMerge)
{
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 1000, 2000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 2000, 3000));
    EXPECT_EQ(list(), (List{{1000, 3000}}));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 5000, 6000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 7000, 8000));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 100, 200));
    EXPECT_EQ(list(), (List{{100, 200}, {1000, 3000}, {5000, 6000}, {7000, 8000}}));
    ASSERT_TRUE(VELMAUDIO_AddSelection(doc, 2500, 9000));
    EXPECT_EQ(list(), (List{{100, 200}, {1000, 9000}}));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 9000);
    EXPECT_EQ(VELMAUDIO_SelectionLength(doc), 100 + 8000);
    EXPECT_EQ(VELMAUDIO_SelectionChunkBegin(doc, -5), 100);
    EXPECT_EQ(VELMAUDIO_SelectionChunkBegin(doc, 2), -1);
}

TEST_F(Sel, SubtractingSplitsAndEmptiesShowTheCursor)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 1000, 5000));
    EXPECT_FALSE(VELMAUDIO_CursorVisible(doc));
    ASSERT_TRUE(VELMAUDIO_DelSelection(doc, 2000, 3000));
    EXPECT_EQ(list(), (List{{1000, 2000}, {3000, 5000}}));
    ASSERT_TRUE(VELMAUDIO_DelSelection(doc, 4000, 1500));
    EXPECT_EQ(list(), (List{{1000, 1500}, {4000, 5000}}));
    EXPECT_EQ(VELMAUDIO_GetSelectionResizeBorder(doc, 1200), VELMAUDIO_GetCursorPosition(doc));
    EXPECT_FALSE(VELMAUDIO_DelSelection(doc, 300, 300));
    ASSERT_TRUE(VELMAUDIO_DelSelection(doc, 0, 10000));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    EXPECT_TRUE(VELMAUDIO_GetState(doc)->cursor.shown);
}

TEST_F(Sel, InvertAndSelectToStart)
{
    EXPECT_FALSE(VELMAUDIO_InvertSelection(doc));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 0, 5000));
    ASSERT_TRUE(VELMAUDIO_InvertSelection(doc));
    EXPECT_EQ(list(), (List{{5000, 10000}}));
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 2500, 5000));
    ASSERT_TRUE(VELMAUDIO_InvertSelection(doc));
    EXPECT_EQ(list(), (List{{0, 2500}, {5000, 10000}}));
    ASSERT_TRUE(VELMAUDIO_SelectAll(doc));
    ASSERT_TRUE(VELMAUDIO_InvertSelection(doc));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));

    ASSERT_TRUE(VELMAUDIO_SetCursorPosition(doc, 4000));
    ASSERT_TRUE(VELMAUDIO_SelectToStart(doc));
    EXPECT_EQ(list(), (List{{0, 4000}}));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 0);
    EXPECT_EQ(VELMAUDIO_GetSelectionResizeBorder(doc, 100), 4000);
    EXPECT_EQ(VELMAUDIO_GetSelectionResizeBorder(doc, 2000), 0); // a tie gives the begin
    // Pointer samples far outside the signal still pick the farther border.
    EXPECT_EQ(VELMAUDIO_GetSelectionResizeBorder(doc, INT64_MIN), 4000);
    EXPECT_EQ(VELMAUDIO_GetSelectionResizeBorder(doc, INT64_MAX), 0);
}

TEST_F(Sel, VetoesStopTheCommand)
{
    VELMAUDIO_AddEventHandler(doc, Counter::handler, &events);
    events.veto = 0x2000B;
    EXPECT_FALSE(VELMAUDIO_AddSelection(doc, 100, 200));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    events.veto = 0x2000F;
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 100, 200)); // clearing an empty list asks nobody
    EXPECT_EQ(events.count(0x2000F), 0);
    EXPECT_FALSE(VELMAUDIO_ClearSelection(doc));
    EXPECT_TRUE(VELMAUDIO_HasSelection(doc));
    EXPECT_EQ(events.count(0x2000C), 1);
}

TEST_F(Sel, DraggingCommitsByKind)
{
    ASSERT_TRUE(VELMAUDIO_SelectAudio(doc, 1000, 3000));
    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, SELECTING_SUBTRACT));
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, 500, 3500));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 3500);
    EXPECT_EQ(VELMAUDIO_GetSelectingAnchor(doc), 500);
    EXPECT_EQ(list(), (List{{1000, 3000}}));
    ASSERT_TRUE(VELMAUDIO_CommitSelecting(doc));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.begin, VELMAUDIO_GetState(doc)->selecting.end);

    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, 7));
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, 200, 900));
    EXPECT_TRUE(VELMAUDIO_CommitSelecting(doc));
    EXPECT_FALSE(VELMAUDIO_HasSelection(doc));

    ASSERT_TRUE(VELMAUDIO_SetSelectingKind(doc, SELECTING_ADD));
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, 6000, 4000));
    ASSERT_TRUE(VELMAUDIO_CommitSelecting(doc));
    EXPECT_EQ(list(), (List{{4000, 6000}}));
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 4000);

    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, 100, 200));
    ASSERT_TRUE(VELMAUDIO_UndoSelecting(doc));
    EXPECT_EQ(VELMAUDIO_GetState(doc)->selectingKind, SELECTING_REPLACE);
    EXPECT_EQ(list(), (List{{4000, 6000}}));
}

TEST_F(Sel, DragsOutsideTheSignalStayInsideIt)
{
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, 20000, 30000)); // wholly past the end
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.begin, 10.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.end, 10.0);
    ASSERT_TRUE(VELMAUDIO_UpdateSelecting(doc, -50, -10)); // wholly before the start
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.begin, 0.0);
    EXPECT_DOUBLE_EQ(VELMAUDIO_GetState(doc)->selecting.end, 0.0);
    EXPECT_EQ(VELMAUDIO_GetCursorPosition(doc), 0);
}

TEST_F(Sel, DurationsOfAbsurdRecordsSaturate)
{
    constexpr int64_t kMax = std::numeric_limits<int64_t>::max();
    VELMSELECTION wide{-1e300, 1e300, nullptr};
    EXPECT_EQ(VELMSELECTION_GetDuration(doc, &wide), kMax);
    VELMSELECTION twice{0.0, 1e300, nullptr};
    VELMSELECTION first{-1e300, 0.0, &twice};
    VELMSTATE *state = VELMSTATE_Create();
    ASSERT_NE(state, nullptr);
    state->selections = &first;
    EXPECT_EQ(VELMSTATE_SelectionSize(doc, state), kMax);
    state->selections = nullptr;
    VELMSTATE_Destroy(state);
}

TEST(SelectionRecord, CompareAndNulls)
{
    VELMSELECTION a{1.0, 2.0, nullptr}, b{1.0, 2.0, nullptr}, c{1.0, 2.5, nullptr};
    EXPECT_TRUE(VELMSELECTION_Compare(&a, &b));
    EXPECT_FALSE(VELMSELECTION_Compare(&a, &c));
    EXPECT_TRUE(VELMSELECTION_Compare(nullptr, nullptr));
    EXPECT_FALSE(VELMSELECTION_Compare(&a, nullptr));
    EXPECT_DOUBLE_EQ(VELMSELECTION_GetDurationTime(&c), 1.5);
    EXPECT_EQ(VELMSELECTION_CreateAudioSelection(nullptr, 0, 1), nullptr);
    EXPECT_EQ(VELMSELECTION_SetBeginTime(nullptr, 1.0), 0);
    EXPECT_EQ(VELMAUDIO_AddSelection(nullptr, 0, 1), 0);
    EXPECT_EQ(VELMAUDIO_HasSelection(nullptr), 0);
}
