// The AUDIOSIGNAL_ region calls on the library's signals.
#include "outside/base/blbase.h"
#include "tests/outside/signal/region/region_signal_support.hpp"

namespace {

using SignalRegions = SignalTest;

TEST_F(SignalRegions, NullSignalsAndBadArgumentsFail)
{
    EXPECT_EQ(AUDIOSIGNAL_AddRegionToTrackEx(nullptr, 0, 0, 1, "x", nullptr, 0), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_ARGUMENT);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(nullptr, 0, 0, 0, 0, nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_FindFirstRegion(nullptr, -1), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, nullptr), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_ReadRegions(nullptr, "x.txt", "LABELS"), 0);
    EXPECT_EQ(AUDIOSIGNAL_DeleteAllRegions(nullptr), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetRegions(signal, nullptr, 4, 0, 0, 0, 0, nullptr), 0);
}

TEST_F(SignalRegions, AddingChangesTheSignalUnlessQuietAndKeepsOnlyRegionFlags)
{
    ASSERT_TRUE(AUDIOSIGNAL_ResetChanges(signal));
    AUDIOREGION *r = AUDIOSIGNAL_AddRegionToTrackEx(
        signal, 0x08 | 0x20 | 0x40 | AUDIOREGION_FLAG_READONLY, 1.0, 2.0, "a", "b", 2);
    ASSERT_NE(r, nullptr);
    EXPECT_FALSE(AUDIOREGION_IsDeleted(r));
    EXPECT_FALSE(AUDIOREGION_CanDelete(r));
    EXPECT_TRUE(AUDIOREGION_IsChanged(r));
    EXPECT_TRUE(AUDIOSIGNAL_HasChanges(signal));
    ASSERT_TRUE(AUDIOSIGNAL_ResetChanges(signal));
    ASSERT_NE(AUDIOSIGNAL_AddRegionToTrackEx(signal, AUDIOREGION_ADD_QUIET, 3.0, 4.0, nullptr,
                                             nullptr, 2),
              nullptr);
    EXPECT_FALSE(AUDIOSIGNAL_HasChanges(signal));
    EXPECT_EQ(AUDIOSIGNAL_AddRegionToTrackEx(signal, 0, 3.0, 4.0, nullptr, nullptr, 16), nullptr);
}

TEST_F(SignalRegions, CountingAndListing)
{
    AUDIOREGION *a = add(1.0, 2.0, 0), *b = add(4.0, 5.0, 1), *c = add(4.5, 9.0, 1),
                *d = add(0.0, 0.5, 2);
    AUDIOREGION_DeleteEx(d, 0);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(signal, 0, 0, 0, 0, nullptr), 4);
    EXPECT_EQ(AUDIOSIGNAL_CountVisibleRegions(signal, 0, 80000), 3);
    EXPECT_EQ(AUDIOSIGNAL_CountVisibleRegions(signal, 33000, 36000), 2);

    AUDIOREGION *found[8] = {};
    ASSERT_EQ(AUDIOSIGNAL_GetVisibleRegions(signal, found, 8, 0, 40000), 3);
    EXPECT_EQ(found[0], a);
    EXPECT_EQ(found[1], b);
    EXPECT_EQ(found[2], c);
    EXPECT_EQ(AUDIOSIGNAL_CountVisibleRegionsOfTrack(signal, 0, 80000, AUDIOREGION_TRACK_BIT(1),
                                                     0, nullptr),
              2);
    ASSERT_EQ(AUDIOSIGNAL_GetVisibleRegionsOfTrack(signal, found, 1, 0, 80000,
                                                   AUDIOREGION_TRACK_BIT(1), 0, nullptr),
              1);
    EXPECT_EQ(found[0], b);
    ASSERT_EQ(AUDIOSIGNAL_GetRegions(signal, found, 8, 0, 0, AUDIOREGION_TRACK_BIT(2), 0, nullptr),
              1);
    EXPECT_EQ(found[0], d);
}

TEST_F(SignalRegions, SelectionPerTrack)
{
    AUDIOREGION *a = add(1.0, 2.0, 0), *b = add(4.0, 5.0, 1), *c = add(6.0, 7.0, 1);
    AUDIOREGION_Select(a);
    AUDIOREGION_Select(b);
    AUDIOREGION_Select(c);
    EXPECT_EQ(AUDIOSIGNAL_CountSelectedRegionsOfTrack(signal, -1), 3);
    EXPECT_EQ(AUDIOSIGNAL_CountSelectedRegionsOfTrack(signal, 1), 2);
    AUDIOREGION *found[4] = {};
    ASSERT_EQ(AUDIOSIGNAL_GetSelectedRegions(signal, 1, found, 4), 2);
    EXPECT_EQ(found[1], c);
    ASSERT_TRUE(AUDIOSIGNAL_UnselectAllRegionsOfTrack(signal, 1));
    EXPECT_EQ(AUDIOSIGNAL_CountSelectedRegionsOfTrack(signal, -1), 1);
    ASSERT_TRUE(AUDIOSIGNAL_UnselectAllRegions(signal));
    EXPECT_FALSE(AUDIOREGION_IsSelected(a));
    EXPECT_EQ(AUDIOSIGNAL_CountSelectedRegionsOfTrack(signal, 99), 0);
}

TEST_F(SignalRegions, WalkingATrack)
{
    AUDIOREGION *a = add(1.0, 2.0, 1), *other = add(1.5, 2.5, 0), *b = add(3.0, 4.0, 1),
                *c = add(5.0, 6.0, 1);
    EXPECT_EQ(AUDIOSIGNAL_FindFirstRegion(signal, 1), a);
    EXPECT_EQ(AUDIOSIGNAL_FindLastRegion(signal, 1), c);
    EXPECT_EQ(AUDIOSIGNAL_FindFirstRegion(signal, -1), a);
    EXPECT_EQ(AUDIOSIGNAL_FindLastRegion(signal, 7), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, a), b);
    EXPECT_EQ(AUDIOSIGNAL_FindPrevRegion(signal, c), b);
    EXPECT_EQ(AUDIOSIGNAL_FindPrevRegion(signal, a), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, other), nullptr);

    // A deleted region is stepped over, and still finds its neighbours.
    AUDIOREGION_DeleteEx(b, 0);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, a), c);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, b), c);
    AUDIOREGION copy = *a;
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(signal, &copy), c);

    AUDIOSIGNAL *foreign = AUDIOSIGNAL_CreateSilence(&format, 8000);
    EXPECT_EQ(AUDIOSIGNAL_FindNextRegion(foreign, a), nullptr);
    AUDIOSIGNAL_Destroy(foreign);
}

TEST_F(SignalRegions, FindingByPlaceAndText)
{
    add(1.0, 2.0, 1, "one");
    AUDIOREGION *two = add(3.0, 4.0, 1, "two");
    AUDIOREGION *wide = add(0.0, 10.0, 2, "all");
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 24000, 32000, nullptr, nullptr, 1,
                                     AUDIOREGION_MATCH_EXACT),
              two);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 24000, 32001, nullptr, nullptr, 1,
                                     AUDIOREGION_MATCH_EXACT),
              nullptr);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 20000, 25000, nullptr, nullptr, -1,
                                     AUDIOREGION_MATCH_OVERLAP),
              wide);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 20000, 40000, nullptr, nullptr, -1,
                                     AUDIOREGION_MATCH_INSIDE),
              two);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 25000, 26000, nullptr, nullptr, 1,
                                     AUDIOREGION_MATCH_CONTAINS),
              two);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 0, -1, "two", nullptr, -1, 0), two);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 0, -1, "two", "no comment", -1, 0), nullptr);
    EXPECT_EQ(AUDIOSIGNAL_FindRegion(signal, 0, 10, nullptr, nullptr, -1, 42), nullptr);
}

TEST_F(SignalRegions, MovingTheSelectedRegionsOfATrack)
{
    AUDIOREGION *a = add(1.0, 2.0, 1), *b = add(3.0, 4.0, 1), *c = add(5.0, 6.0, 1),
                *d = add(5.0, 6.0, 0);
    AUDIOREGION_Select(a);
    AUDIOREGION_Select(c);
    AUDIOREGION_Select(d);
    ASSERT_TRUE(AUDIOSIGNAL_OffsetRegions(signal, -4000, 1, AUDIOREGION_IsSelected));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(a), 0.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(b), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(c), 4.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(d), 5.0);
    // Limited by the first region reaching the start.
    ASSERT_TRUE(AUDIOSIGNAL_OffsetRegions(signal, -80000, 1, AUDIOREGION_IsSelected));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(a), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(c), 4.0);
    EXPECT_FALSE(AUDIOSIGNAL_OffsetRegions(signal, 100, 5, nullptr));
}

TEST_F(SignalRegions, WritingSavedStatesBackRestoresRegions)
{
    AUDIOREGION *parent = add(1.0, 5.0, 0), *child = add(1.0, 3.0, 1);
    ASSERT_TRUE(AUDIOREGION_SetParent(child, parent));

    // Save every region's flags and times, as an undo step does.
    const int n = AUDIOSIGNAL_CountRegions(signal, 0, 0, 0, 0, nullptr);
    std::vector<AUDIOREGION *> handles(static_cast<size_t>(n));
    ASSERT_EQ(AUDIOSIGNAL_GetRegions(signal, handles.data(), n, 0, 0, 0, 0, nullptr), n);
    std::vector<AUDIOREGION> saved;
    for (AUDIOREGION *h : handles) saved.push_back(*h);

    // Edit, then put the saved state back.
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(parent, 9.0, AUDIOREGION_CHANGE_SCALE));
    AUDIOREGION *later = add(7.0, 8.0, 0);
    ASSERT_TRUE(AUDIOSIGNAL_DeleteAllRegions(signal));
    for (size_t i = 0; i < handles.size(); ++i) {
        handles[i]->flags = saved[i].flags;
        handles[i]->begin = saved[i].begin;
        handles[i]->length = saved[i].length;
    }
    ASSERT_TRUE(AUDIOSIGNAL_AdjustRegionChildShares(signal));

    EXPECT_TRUE(AUDIOREGION_IsDeleted(later));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(parent));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(parent), 5.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(child), 3.0);
    double begin = 0, length = 0;
    ASSERT_TRUE(AUDIOREGION_GetChildShare(child, &begin, &length));
    EXPECT_DOUBLE_EQ(length, 0.5);
}

struct Captured {
    std::vector<std::string> messages;
    static void sink(int kind, int level, const char *message, void *user)
    {
        static_cast<Captured *>(user)->messages.emplace_back(message);
    }
};

TEST_F(SignalRegions, RegionFilesThroughTheSignal)
{
    const std::string labels = dir.file("in.txt");
    write_bytes(labels, "1\t2\tgood\nbroken line\n3\t4\talso good\n");
    Captured log;
    BLDEBUG_SetSink(Captured::sink, &log);
    EXPECT_EQ(AUDIOSIGNAL_ReadRegions(signal, labels.c_str(), "LABELS[track=words]"), 1);
    BLDEBUG_SetSink(nullptr, nullptr);
    ASSERT_EQ(log.messages.size(), 1u);
    EXPECT_NE(log.messages[0].find("line 2"), std::string::npos);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(signal, 0, 0, AUDIOREGION_TRACK_BIT(doc.tracks["words"]),
                                       0, nullptr),
              2);

    const std::string own = dir.file("out.vrgn");
    ASSERT_EQ(AUDIOSIGNAL_WriteRegions(signal, own.c_str(), "AUTO"), 1);
    EXPECT_NE(read_bytes(own).find("track\t1\twords"), std::string::npos);

    EXPECT_EQ(AUDIOSIGNAL_ReadRegions(signal, dir.file("missing.txt").c_str(), "LABELS"), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_FILE_NOT_FOUND);
    EXPECT_EQ(AUDIOSIGNAL_WriteRegions(signal, own.c_str(), "MIDI"), 0);
    EXPECT_EQ(AUDIOSIGNAL_GetLastError(), AUDIO_ERROR_BAD_FORMAT_STRING);
}

}  // namespace
