// Nested regions: parents, descendants, shares, and how edits of a parent
// carry its children.
#include <gtest/gtest.h>

#include "tests/outside/signal/region/region_test_support.hpp"

using velmsig::Region;
using velmsig::RegionSet;

namespace {

class Nesting : public ::testing::Test {
protected:
    TestHost host;   // 8000 Hz, ten seconds
    RegionSet set{&host};
    Region *sentence = nullptr, *first = nullptr, *second = nullptr, *sound = nullptr;

    void SetUp() override
    {
        // sentence [2, 6]: words [2, 4] and [4, 6]; a sound [2.5, 3] in the first.
        sentence = set.add(2.0, 6.0, 0, 0, "sentence", nullptr);
        first = set.add(2.0, 4.0, 1, 0, "one", nullptr);
        second = set.add(4.0, 6.0, 1, 0, "two", nullptr);
        sound = set.add(2.5, 3.0, 2, 0, "w", nullptr);
        ASSERT_TRUE(AUDIOREGION_SetParent(first, sentence));
        ASSERT_TRUE(AUDIOREGION_SetParent(second, sentence));
        ASSERT_TRUE(AUDIOREGION_SetParent(sound, first));
    }
};

TEST_F(Nesting, FamilyQueries)
{
    EXPECT_EQ(AUDIOREGION_GetParent(sound), first);
    EXPECT_EQ(AUDIOREGION_TopParent(sound), sentence);
    EXPECT_EQ(AUDIOREGION_TopParent(sentence), sentence);
    ASSERT_EQ(AUDIOREGION_GetNumDescendents(sentence), 3);
    AUDIOREGION *all[4] = {};
    ASSERT_EQ(AUDIOREGION_GetDescendents(sentence, all, 4), 3);
    EXPECT_EQ(all[0], first);
    EXPECT_EQ(all[1], sound);
    EXPECT_EQ(all[2], second);
    EXPECT_EQ(AUDIOREGION_GetDescendents(sentence, all, 2), 2);

    double begin = 0, length = 0;
    ASSERT_TRUE(AUDIOREGION_GetChildShare(second, &begin, &length));
    EXPECT_DOUBLE_EQ(begin, 0.5);
    EXPECT_DOUBLE_EQ(length, 0.5);
    ASSERT_TRUE(AUDIOREGION_GetChildShare(sound, &begin, &length));
    EXPECT_DOUBLE_EQ(begin, 0.25);
    EXPECT_DOUBLE_EQ(length, 0.25);
}

TEST_F(Nesting, CyclesAndForeignParentsAreRefused)
{
    EXPECT_FALSE(AUDIOREGION_SetParent(sentence, sound));
    EXPECT_FALSE(AUDIOREGION_SetParent(sentence, sentence));
    TestHost other_host;
    RegionSet other(&other_host);
    Region *foreign = other.add(0.0, 9.0, 0, 0, nullptr, nullptr);
    EXPECT_FALSE(AUDIOREGION_SetParent(sound, foreign));
    EXPECT_EQ(AUDIOREGION_GetParent(sound), first);

    // Detaching makes a top region again.
    ASSERT_TRUE(AUDIOREGION_SetParent(sound, nullptr));
    EXPECT_EQ(AUDIOREGION_TopParent(sound), sound);
    EXPECT_EQ(AUDIOREGION_GetNumDescendents(sentence), 2);
}

TEST_F(Nesting, DeepChainsAreBounded)
{
    Region *parent = set.add(0.0, 10.0, 3, 0, nullptr, nullptr);
    int depth = 0;
    for (int i = 0; i < 100; ++i) {
        Region *child = set.add(0.0, 10.0, 3, 0, nullptr, nullptr);
        if (!AUDIOREGION_SetParent(child, parent)) break;
        parent = child;
        ++depth;
    }
    EXPECT_EQ(depth, RegionSet::kMaxDepth);
}

TEST_F(Nesting, AChildIsCutToItsParent)
{
    Region *wide = set.add(1.0, 7.0, 1, 0, nullptr, nullptr);
    ASSERT_TRUE(AUDIOREGION_SetParent(wide, sentence));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(wide), 2.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(wide), 6.0);
}

TEST_F(Nesting, ScalingAParentScalesItsDescendants)
{
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(sentence, 10.0, AUDIOREGION_CHANGE_SCALE));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(first), 6.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(second), 6.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(second), 10.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(sound), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(sound), 4.0);
}

TEST_F(Nesting, MovingAParentEdgeCarriesOnlyTheChildAtThatEdge)
{
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(sentence, 7.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(first), 4.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(second), 4.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(second), 7.0);

    // Shrinking past a child cuts it; the one beyond shrinks to the edge.
    ASSERT_TRUE(AUDIOREGION_ChangeEnd(sentence, 3.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(first), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(second), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Length(second), 0.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(sound), 3.0);

    // A child's edge cannot leave its parent.
    ASSERT_TRUE(AUDIOREGION_ChangeBegin(first, 0.0, 0));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(first), 2.0);
}

TEST_F(Nesting, OffsetsCarryDescendantsAndStayInTheParent)
{
    ASSERT_TRUE(AUDIOREGION_Offset(sentence, 8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(first), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(sound), 3.5);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(second), 7.0);

    ASSERT_TRUE(AUDIOREGION_Offset(sound, 10 * 8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(sound), AUDIOREGION_End(first));

    // A parent and its child in one move go once.
    ASSERT_TRUE(set.offset({sound, sentence}, -8000));
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(sentence), 2.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(sound), 4.0);
}

TEST_F(Nesting, SharesFollowTimesWrittenFromOutside)
{
    // As an undo writes a saved state back into the records.
    second->begin = 5.0;
    second->length = 1.0;
    set.adjust_child_shares();
    double begin = 0, length = 0;
    ASSERT_TRUE(AUDIOREGION_GetChildShare(second, &begin, &length));
    EXPECT_DOUBLE_EQ(begin, 0.75);
    EXPECT_DOUBLE_EQ(length, 0.25);
}

TEST_F(Nesting, DeletingAParentDeletesItsDescendants)
{
    ASSERT_TRUE(AUDIOREGION_DeleteEx(first, 0));
    EXPECT_TRUE(AUDIOREGION_IsDeleted(sound));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(second));
    ASSERT_TRUE(AUDIOREGION_UndeleteEx(first, 0));
    EXPECT_FALSE(AUDIOREGION_IsDeleted(sound));
}

TEST_F(Nesting, CutsMoveEveryLevel)
{
    set.on_remove(2 * 8000, 8000);   // [2 s, 3 s)
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(sentence), 5.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_End(first), 3.0);
    EXPECT_DOUBLE_EQ(AUDIOREGION_Begin(second), 3.0);
    EXPECT_TRUE(AUDIOREGION_IsDeleted(sound));
    double begin = 0, length = 0;
    ASSERT_TRUE(AUDIOREGION_GetChildShare(second, &begin, &length));
    EXPECT_DOUBLE_EQ(begin, 1.0 / 3.0);
}

TEST_F(Nesting, ACopiedSetHasItsOwnRegions)
{
    TestHost copy_host;
    RegionSet copy(&copy_host);
    copy.copy_from(set);
    ASSERT_EQ(copy.size(), set.size());
    const std::vector<Region *> regions = copy.track_regions(2);
    ASSERT_EQ(regions.size(), 1u);
    Region *copied_sound = regions[0];
    EXPECT_NE(copied_sound, sound);
    EXPECT_STREQ(AUDIOREGION_GetLabel(copied_sound), "w");
    EXPECT_STREQ(AUDIOREGION_GetLabel(AUDIOREGION_TopParent(copied_sound)), "sentence");
    EXPECT_EQ(AUDIOREGION_GetParentSignal(copied_sound), copy_host.region_signal());
    ASSERT_TRUE(AUDIOREGION_SetLabel(copied_sound, "changed"));
    EXPECT_STREQ(AUDIOREGION_GetLabel(sound), "w");
}

}  // namespace
