// The first VELMRESOURCES_Load of a process, before and after the host made
// its QGuiApplication.  A program of its own, since the handles live for
// the whole process.
#include "outside/base/blbase.h"
#include "widgets/resources/velmresources.h"
#include "widgets/guiapp.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

std::vector<std::string> warnings;

void CollectWarnings(int kind, int, const char *message, void *)
{
    if (kind == BLDEBUG_KIND_WARNING) warnings.emplace_back(message);
}

TEST(FirstLoad, FailsWithoutAGuiApplicationAndSucceedsOnceACanvasIsMade)
{
    BLDEBUG_SetSink(CollectWarnings, nullptr);
    EXPECT_EQ(VELMRESOURCES_Load(), 0);
    BLDEBUG_SetSink(nullptr, nullptr);
    EXPECT_EQ(Img_Background, nullptr);
    EXPECT_EQ(Img_ZoomVertOut, nullptr);
    ASSERT_EQ(warnings.size(), 1u);
    EXPECT_EQ(warnings[0], "VELMRESOURCES_Load: Unable to load 50 of 50 pictures");

    // Making a canvas loads the set, as the canvas does for every host.
    MakeGuiApplication();
    VELMCANVAS canvas = VELMCANVAS_CreateCanvasQT(nullptr, 16, 16);
    ASSERT_NE(canvas, nullptr);
    EXPECT_NE(Img_Background, nullptr);
    EXPECT_NE(Img_ZoomVertOut, nullptr);
    EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, Img_ZoomVertOut), 20);
    VELMCANVAS_DestroyCanvas(canvas);
}

} // namespace
