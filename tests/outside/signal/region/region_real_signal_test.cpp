// Regions on the signal library's own signals: they move with edits, travel
// with duplicates, ask the signal's parent for track numbers, and live in
// the WAV files the signals are saved to.
#include "tests/outside/signal/region/region_signal_support.hpp"

namespace {

using RealSignal = SignalTest;

TEST_F(RealSignal, CutsAndPastesMoveRegions)
{
    AUDIOREGION *before = add(0.5, 1.0), *through = add(1.5, 3.0), *inside = add(2.2, 2.4),
                *after = add(5.0, 6.0);
    AUDIOSIGNAL *clip = AUDIOSIGNAL_CutEx(signal, nullptr, 0, 16000, 24000);   // [2 s, 3 s)
    ASSERT_NE(clip, nullptr);
    EXPECT_EQ(span(before), Span(4000, 8000));
    EXPECT_EQ(span(through), Span(12000, 16000));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(inside));
    EXPECT_EQ(span(after), Span(32000, 40000));

    // Pasting a second back in at 1 s: before the later regions, inside one.
    ASSERT_TRUE(AUDIOSIGNAL_PasteEx(signal, clip, 0, 8000, 8000, nullptr));
    EXPECT_EQ(span(before), Span(4000, 8000));
    EXPECT_EQ(span(through), Span(20000, 24000));
    EXPECT_EQ(span(after), Span(40000, 48000));
    ASSERT_TRUE(AUDIOSIGNAL_PasteEx(signal, clip, 0, 6000, 6000, nullptr));
    EXPECT_EQ(span(before), Span(4000, 16000));
    AUDIOSIGNAL_Destroy(clip);
}

TEST_F(RealSignal, RegionEditsAreChangesOfTheSignal)
{
    ASSERT_TRUE(AUDIOSIGNAL_ResetChanges(signal));
    AUDIOREGION *quiet = AUDIOSIGNAL_AddRegionToTrackEx(signal, AUDIOREGION_ADD_QUIET, 1.0, 2.0,
                                                        "q", nullptr, 0);
    ASSERT_NE(quiet, nullptr);
    AUDIOREGION_Select(quiet);
    EXPECT_FALSE(AUDIOSIGNAL_HasChanges(signal));
    ASSERT_TRUE(AUDIOREGION_SetLabel(quiet, "changed"));
    EXPECT_TRUE(AUDIOSIGNAL_HasChanges(signal));
    EXPECT_EQ(AUDIOREGION_GetParentSignal(quiet), signal);
}

TEST_F(RealSignal, DuplicatesHaveTheirOwnRegions)
{
    AUDIOREGION *original = add(1.0, 2.0, 0, "kept");
    AUDIOSIGNAL *copy = AUDIOSIGNAL_DuplicateEx(signal, 0);
    ASSERT_NE(copy, nullptr);
    AUDIOREGION *copied = AUDIOSIGNAL_FindFirstRegion(copy, 0);
    ASSERT_NE(copied, nullptr);
    EXPECT_NE(copied, original);
    EXPECT_STREQ(AUDIOREGION_GetLabel(copied), "kept");
    EXPECT_EQ(AUDIOREGION_GetParentSignal(copied), copy);
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(copied, 4.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(original), 2.0);
    AUDIOSIGNAL_Destroy(copy);
}

TEST_F(RealSignal, TrackNamesComeFromTheParent)
{
    const std::string path = dir.file("tracks.vrgn");
    write_bytes(path,
                "VELM-REGIONS\t1\n"
                "track\t4\tspeaker\tSpeaker turns\n"
                "region\t0\t-\t4\t0\t1\t2\tAnna\t\\N\n");
    ASSERT_EQ(AUDIOSIGNAL_ReadRegions(signal, path.c_str(), "VRGN"), 1);
    ASSERT_EQ(doc.tracks.count("speaker"), 1u);
    EXPECT_EQ(doc.labels["speaker"], "Speaker turns");
    AUDIOREGION *anna = AUDIOSIGNAL_FindFirstRegion(signal, doc.tracks["speaker"]);
    ASSERT_NE(anna, nullptr);
    EXPECT_STREQ(AUDIOREGION_GetLabel(anna), "Anna");
}

TEST_F(RealSignal, CuesInTheSavedWaveFile)
{
    const std::string path = dir.file("take.wav");
    ASSERT_TRUE(AUDIOSIGNAL_Save(signal, path.c_str(), "WAVE"));
    add(0.25, 0.25, 0, "cue");
    add(1.0, 1.5, 0, "range");
    ASSERT_EQ(AUDIOSIGNAL_WriteRegions(signal, path.c_str(), "AUTO"), 1);

    AUDIOSIGNAL *opened = AUDIOSIGNAL_OpenEx(path.c_str(), "AUTO", 0, nullptr, nullptr);
    ASSERT_NE(opened, nullptr);
    EXPECT_EQ(AUDIOSIGNAL_NumSamples(opened), 80000);
    ASSERT_EQ(AUDIOSIGNAL_ReadRegions(opened, path.c_str(), "WAVE"), 1);
    EXPECT_EQ(AUDIOSIGNAL_CountRegions(opened, 0, 0, 0, 0, nullptr), 2);
    AUDIOREGION *range = AUDIOSIGNAL_FindRegion(opened, 0, -1, "range", nullptr, -1, 0);
    ASSERT_NE(range, nullptr);
    EXPECT_EQ(span(range), Span(8000, 12000));
    AUDIOSIGNAL_Destroy(opened);
}

}  // namespace
