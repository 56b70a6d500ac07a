// Regions of one signal: creation, queries, moving with the audio, and the
// AUDIOREGION_ calls on regions and on copies of their records.
#include <gtest/gtest.h>

#include <cmath>
#include <limits>
#include <string>

#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionQuery;
using velmsig::RegionSet;

namespace {

class Regions : public ::testing::Test {
protected:
    TestHost host;   // 8000 Hz, 80000 frames
    RegionSet set{&host};

    Region *add(double begin, double end, int track = 0, const char *label = nullptr)
    {
        return set.add(begin, end, track, 0, label, nullptr);
    }
};

TEST_F(Regions, NewRegionsAreClampedToTheSignalAndRefuseBadInput)
{
    Region *r = add(9.5, 12.0);
    ASSERT_NE(r, nullptr);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 9.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 10.0);

    Region *reversed = add(3.0, 1.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(reversed), 1.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(reversed), 2.0);

    Region *before = add(-4.0, -1.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(before), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(before), 0.0);

    EXPECT_EQ(add(0.0, std::nan(""), 0), nullptr);
    EXPECT_EQ(add(0.0, 1.0, 16), nullptr);
    EXPECT_EQ(add(0.0, 1.0, -1), nullptr);
    EXPECT_EQ(set.size(), 3u);
}

TEST_F(Regions, SamplesFollowTheSignalRate)
{
    Region *r = add(0.5, 1.25, 3);
    EXPECT_EQ(AUDIOREGION_BeginSample(r), 4000);
    EXPECT_EQ(AUDIOREGION_EndSample(r), 10000);
    EXPECT_EQ(AUDIOREGION_NumSamples(r), 6000);
    EXPECT_EQ(AUDIOREGION_GetTrackId(r), 3);
    EXPECT_EQ(AUDIOREGION_GetParentSignal(r), host.region_signal());
    EXPECT_TRUE(AUDIOREGION_IsBetween(r, 0, 4000));
    EXPECT_FALSE(AUDIOREGION_IsBetween(r, 10001, 20000));
    EXPECT_TRUE(AUDIOREGION_IsFullVisible(r, 4000, 10000));
    EXPECT_FALSE(AUDIOREGION_IsFullVisible(r, 4001, 20000));
    // Relabelling the signal keeps the times.
    host.rate = 16000;
    EXPECT_EQ(AUDIOREGION_BeginSample(r), 8000);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 0.5);
}

TEST_F(Regions, NullAndZeroedRecordsGiveFailureValues)
{
    AUDIOREGION zero{};
    for (const AUDIOREGION *r : {static_cast<const AUDIOREGION *>(nullptr),
                                 static_cast<const AUDIOREGION *>(&zero)}) {
        EXPECT_EQ(AUDIOREGION_Begin(r), -1.0);
        EXPECT_EQ(AUDIOREGION_Length(r), -1.0);
        EXPECT_EQ(AUDIOREGION_BeginSample(r), -1);
        EXPECT_EQ(AUDIOREGION_NumSamples(r), -1);
        EXPECT_EQ(AUDIOREGION_GetTrackId(r), -1);
        EXPECT_EQ(AUDIOREGION_GetLabel(r), nullptr);
        EXPECT_EQ(AUDIOREGION_TopParent(r), nullptr);
        EXPECT_EQ(AUDIOREGION_GetParentSignal(r), nullptr);
        EXPECT_EQ(AUDIOREGION_IsSelected(r), 0);
        EXPECT_EQ(AUDIOREGION_CanDelete(r), 0);
        EXPECT_EQ(AUDIOREGION_GetNumDescendents(r), 0);
    }
    EXPECT_EQ(AUDIOREGION_SetLabel(&zero, "x"), 0);
    EXPECT_EQ(AUDIOREGION_ChangeEnd(&zero, 1.0, 0), 0);
    EXPECT_EQ(AUDIOREGION_Offset(nullptr, 5), 0);
    EXPECT_EQ(AUDIOREGION_Select(&zero), 0);
    EXPECT_EQ(AUDIOREGION_DeleteEx(nullptr, 0), 0);
}

TEST_F(Regions, ACopyAnswersWithItsOwnTimesAndEditsReachTheRegion)
{
    Region *r = add(1.0, 2.0, 0, "word");
    AUDIOREGION copy = *r;
    ASSERT_EQ(copy.identity, r);

    // The copy remembers the old edge, so a caller can compare them.
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(r, 3.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(&copy), 2.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 3.0);

    // Edits through a copy change the region and refresh the copy.
    ASSERT_TRUE(AUDIOREGION_ChangeBegin(&copy, 0.5, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 0.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(&copy), 3.0);
    ASSERT_TRUE(AUDIOREGION_SetLabel(&copy, "other"));
    EXPECT_STREQ(AUDIOREGION_GetLabel(r), "other");
    ASSERT_TRUE(AUDIOREGION_Offset(&copy, 8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 1.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(&copy), 1.5);
}

TEST_F(Regions, EdgesStayInsideTheSignalAndInOrder)
{
    Region *r = add(2.0, 4.0);
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(r, 99.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 10.0);
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(r, 1.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 2.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(r), 0.0);
    ASSERT_TRUE(AUDIOREGION_ChangeBegin(r, -3.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 2.0);
    EXPECT_EQ(AUDIOREGION_ChangeBegin(r, std::numeric_limits<double>::infinity(), 0), 0);
    EXPECT_TRUE(AUDIOREGION_IsChanged(r));
}

TEST_F(Regions, OffsetStopsAtTheSignalEdges)
{
    Region *r = add(8.0, 9.0);
    ASSERT_TRUE(AUDIOREGION_Offset(r, 5 * 8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(r), 10.0);
    ASSERT_TRUE(AUDIOREGION_Offset(r, -20 * 8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(r), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(r), 1.0);
}

TEST_F(Regions, MovingSeveralKeepsTheirSpacing)
{
    Region *a = add(1.0, 2.0), *b = add(8.0, 9.5);
    ASSERT_TRUE(set.offset({a, b}, 4 * 8000));   // b can move only half a second
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(a), 1.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(b), 8.5);
}

TEST_F(Regions, CutsMoveShortenOrRemoveRegions)
{
    // Cut [2 s, 3 s) = frames [16000, 24000).
    Region *before = add(0.5, 1.5), *touching = add(1.0, 2.0), *through_begin = add(1.5, 2.5),
           *inside = add(2.2, 2.8), *through_end = add(2.5, 4.0), *over = add(1.0, 5.0),
           *after = add(6.0, 7.0), *point_at_cut = add(2.0, 2.0), *point_in_cut = add(2.5, 2.5);
    set.on_remove(16000, 8000);

    EXPECT_EQ(span(before), Span(4000, 12000));
    EXPECT_EQ(span(touching), Span(8000, 16000));
    EXPECT_EQ(span(through_begin), Span(12000, 16000));
    EXPECT_EQ(span(through_end), Span(16000, 24000));
    EXPECT_EQ(span(over), Span(8000, 32000));
    EXPECT_EQ(span(after), Span(40000, 48000));
    EXPECT_EQ(span(point_at_cut), Span(16000, 16000));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(inside));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(point_in_cut));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(through_end));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(point_at_cut));
}

TEST_F(Regions, InsertionsShiftOrLengthenRegions)
{
    Region *before = add(0.5, 1.0), *at_begin = add(2.0, 3.0), *around = add(1.5, 2.5),
           *at_end = add(1.0, 2.0);
    set.on_insert(16000, 4000);   // half a second at 2 s
    EXPECT_EQ(span(before), Span(4000, 8000));
    EXPECT_EQ(span(at_begin), Span(20000, 28000));
    EXPECT_EQ(span(around), Span(12000, 24000));
    EXPECT_EQ(span(at_end), Span(8000, 16000));
}

TEST_F(Regions, QueriesFilterByTimeTrackFlagsAndFunction)
{
    Region *a = add(1.0, 2.0, 0), *b = add(0.5, 0.6, 1), *c = add(5.0, 6.0, 1),
           *d = add(5.0, 5.5, 2);
    AUDIOREGION_Select(c);
    AUDIOREGION_DeleteEx(d, 0);

    RegionQuery all;
    EXPECT_EQ(set.select(all), (std::vector<Region *>{b, a, d, c}));
    RegionQuery window;
    window.begin = 8000;
    window.end = 40000;
    window.skip_flags = AUDIOREGION_FLAG_DELETED;
    EXPECT_EQ(set.select(window), (std::vector<Region *>{a, c}));
    RegionQuery tracks;
    tracks.tracks = AUDIOREGION_TRACK_BIT(1) | AUDIOREGION_TRACK_BIT(2);
    tracks.filter = AUDIOREGION_IsSelected;
    EXPECT_EQ(set.select(tracks), (std::vector<Region *>{c}));
    EXPECT_EQ(set.track_regions(1), (std::vector<Region *>{b, c}));
    EXPECT_EQ(set.track_regions(-1), (std::vector<Region *>{b, a, c}));
}

TEST_F(Regions, FlagsSelectionAndDeletion)
{
    Region *r = add(1.0, 2.0);
    ASSERT_TRUE(AUDIOREGION_Select(r));
    EXPECT_TRUE(AUDIOREGION_IsSelected(r));
    ASSERT_TRUE(AUDIOREGION_Unselect(r));
    EXPECT_FALSE(AUDIOREGION_IsSelected(r));

    ASSERT_TRUE(AUDIOREGION_SetReadOnly(r, 1));
    EXPECT_EQ(r->flags & AUDIOREGION_FLAG_READONLY, AUDIOREGION_FLAG_READONLY);
    EXPECT_FALSE(AUDIOREGION_CanDelete(r));
    ASSERT_TRUE(AUDIOREGION_SetReadOnly(r, 0));
    EXPECT_TRUE(AUDIOREGION_CanDelete(r));
    ASSERT_TRUE(AUDIOREGION_SetHideText(r, 1));
    EXPECT_EQ(r->flags & AUDIOREGION_FLAG_HIDETEXT, AUDIOREGION_FLAG_HIDETEXT);

    ASSERT_TRUE(AUDIOREGION_DeleteEx(r, 0));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(r));
    EXPECT_FALSE(AUDIOREGION_CanDelete(r));
    EXPECT_FALSE(AUDIOREGION_Select(r));
    ASSERT_TRUE(AUDIOREGION_UndeleteEx(r, 0));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(r));

    ASSERT_TRUE(AUDIOREGION_SetTrackId(r, 15));
    EXPECT_EQ(AUDIOREGION_GetTrackId(r), 15);
    EXPECT_FALSE(AUDIOREGION_SetTrackId(r, 16));
    EXPECT_EQ(AUDIOREGION_GetTrackId(r), 15);

    set.delete_all();
    EXPECT_TRUE(AUDIOREGION_IsDeleted(r));
}

TEST_F(Regions, TextsAndChangeNotifications)
{
    Region *r = add(1.0, 2.0);
    EXPECT_EQ(AUDIOREGION_GetLabel(r), nullptr);
    EXPECT_EQ(AUDIOREGION_GetComment(r), nullptr);
    ASSERT_TRUE(AUDIOREGION_SetLabel(r, ""));
    EXPECT_STREQ(AUDIOREGION_GetLabel(r), "");
    ASSERT_TRUE(AUDIOREGION_SetComment(r, "tab\there"));
    EXPECT_STREQ(AUDIOREGION_GetComment(r), "tab\there");
    ASSERT_TRUE(AUDIOREGION_SetComment(r, nullptr));
    EXPECT_EQ(AUDIOREGION_GetComment(r), nullptr);
    const std::string huge(100000, 'x');
    EXPECT_FALSE(AUDIOREGION_SetLabel(r, huge.c_str()));
    EXPECT_STREQ(AUDIOREGION_GetLabel(r), "");
    EXPECT_EQ(host.changes, 3);

    // Selection is not a change of the document.
    AUDIOREGION_Select(r);
    AUDIOREGION_Unselect(r);
    EXPECT_EQ(host.changes, 3);
}

}  // namespace
