// Entry points that lean on the host or on the base services.
#include "outside/base/blbase.h"
#include "render/canvas/velmcanvas.h"

#include <gtest/gtest.h>

namespace {

TEST(QtEntryPoints, NeedAnApplicationMadeByTheHost)
{
    // This executable never makes a QGuiApplication.
    EXPECT_EQ(VELMCANVAS_CreateCanvasQT(nullptr, 100, 100), nullptr);
    const unsigned char png_signature[] = {0x89, 'P', 'N', 'G', '\r', '\n', 0x1A, '\n'};
    EXPECT_EQ(VELMCANVAS_LoadImageQT(png_signature, sizeof png_signature), nullptr);
}

TEST(Display, SizeComesFromTheBaseServices)
{
    BLUTILS_SetDisplaySize(2560, 1440);
    EXPECT_EQ(VELMCANVAS_GetDisplayWidth(), 2560);
    EXPECT_EQ(VELMCANVAS_GetDisplayHeight(), 1440);
}

} // namespace
