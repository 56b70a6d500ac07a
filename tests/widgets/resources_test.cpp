// VELMRESOURCES_Load in a program with a QGuiApplication: every handle is
// loaded once, at the size the view expects, and kept by later calls.
#include "widgets/resources/velmresources.h"
#include "widgets/expected_pictures.h"
#include "widgets/guiapp.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

namespace {

struct Handle {
    std::string name;
    int width, height;
    VELMCANVASIMAGE *image;
};

std::vector<Handle> Handles()
{
#define VELM_HANDLE(name, width, height) {#name, width, height, &Img_##name},
    return {VELM_EXPECTED_PICTURES(VELM_HANDLE)};
#undef VELM_HANDLE
}

class ResourcesLoad : public ::testing::Test {
protected:
    void SetUp() override
    {
        MakeGuiApplication();
        canvas = VELMCANVAS_CreateCanvasQT(nullptr, 16, 16);
        ASSERT_NE(canvas, nullptr);
    }
    void TearDown() override { VELMCANVAS_DestroyCanvas(canvas); }

    VELMCANVAS canvas = nullptr;
};

TEST_F(ResourcesLoad, LoadsEveryHandleAtItsPictureSize)
{
    ASSERT_EQ(VELMRESOURCES_Load(), 1);
    for (const Handle &handle : Handles()) {
        SCOPED_TRACE(handle.name);
        ASSERT_NE(*handle.image, nullptr);
        EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, *handle.image), handle.width);
        EXPECT_EQ(VELMCANVAS_ImageHeight(canvas, *handle.image), handle.height);
    }
}

TEST_F(ResourcesLoad, ASecondLoadKeepsTheLoadedImages)
{
    ASSERT_EQ(VELMRESOURCES_Load(), 1);
    std::vector<VELMCANVASIMAGE> first;
    for (const Handle &handle : Handles()) first.push_back(*handle.image);
    EXPECT_EQ(VELMRESOURCES_Load(), 1);
    // A reload would have made new images (the old ones are never freed,
    // so their addresses cannot come back).
    const std::vector<Handle> handles = Handles();
    for (size_t i = 0; i < handles.size(); ++i) EXPECT_EQ(*handles[i].image, first[i]) << handles[i].name;
}

TEST_F(ResourcesLoad, OnlyAMissingHandleIsLoadedAgain)
{
    ASSERT_EQ(VELMRESOURCES_Load(), 1);
    const VELMCANVASIMAGE kept = Img_ZoomIn;
    const VELMCANVASIMAGE dropped = Img_VolumeOn;
    Img_VolumeOn = nullptr;
    EXPECT_EQ(VELMRESOURCES_Load(), 1);
    EXPECT_EQ(Img_ZoomIn, kept);
    ASSERT_NE(Img_VolumeOn, nullptr);
    EXPECT_NE(Img_VolumeOn, dropped);
    EXPECT_EQ(VELMCANVAS_ImageWidth(canvas, Img_VolumeOn), 30);
    VELMCANVAS_DestroyImage(canvas, dropped);
}

} // namespace
