#include "core/velmaudio.h"
#include "core/velmconfig.h"
#include "render/canvas/velmcanvas.h"

#include <gtest/gtest.h>

#include <string>

TEST(ConfigDefaults, RegisteredAtStartUp)
{
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.general.msscaleframeduration"), 20);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset"), "narrow");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.spectral.wide.winsize"), 40);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.custom.colorscheme"), "ce2k");
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "libvelm.spectral.narrow.preemphcoef"), 0.9);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.windowbgcolor"), 0x404000);
    EXPECT_EQ(static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.darktransparency")), 0x80000000u);
    EXPECT_EQ(static_cast<uint32_t>(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.playcursor.activecolor")), 0xE01921FFu);
    EXPECT_TRUE(BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.AudioDragActive"));
    EXPECT_FALSE(BLSETTINGS_GetBoolEx(nullptr, "libvelm.draw.playcursor.drawshadow"));
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.draw.RegionTextFont.FamilyName"), "Tahoma");
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "libvelm.draw.PhoneticTextFont.Size"), 16.0);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.display.gradient.off.1"), 0x101000);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.playback.devicename"), "default");
}

TEST(ConfigDefaults, UserValuesSurviveAReset)
{
    ASSERT_TRUE(BLSETTINGS_ChangeEx(nullptr, "libvelm.draw.hovertime=%d", 750));
    VELMCONFIG_ResetConfiguration();
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 750);
    BLSETTINGS_DeleteEx(nullptr, "libvelm.draw.hovertime");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 500);
}

TEST(ConfigEnums, DecodeIsExactAndEncodeTakesTheFirstName)
{
    EXPECT_EQ(VELMCONFIG_DecodeHorzScaleKind("frm_view", -1), 5);
    EXPECT_EQ(VELMCONFIG_DecodeHorzScaleKind("Time", -1), -1);
    EXPECT_EQ(VELMCONFIG_DecodeHorzScaleKind(nullptr, 3), 3);
    EXPECT_STREQ(VELMCONFIG_EncodeHorzScaleKind(2), "frame");
    EXPECT_STREQ(VELMCONFIG_EncodeHorzScaleKind(9), "undef");
    EXPECT_EQ(VELMCONFIG_DecodeVertScaleKind("%", 0), 2);
    EXPECT_STREQ(VELMCONFIG_EncodeVertScaleKind(3), "normalized");
    EXPECT_EQ(VELMCONFIG_DecodeSpecScaleKind("mel", 0), 1);
    EXPECT_STREQ(VELMCONFIG_EncodeWinType(2), "blackman");
    EXPECT_STREQ(VELMCONFIG_EncodeWinType(12), "blackman");
    EXPECT_EQ(VELMCONFIG_DecodeWinType(VELMCONFIG_EncodeWinType(2), 0), 5);
    EXPECT_EQ(VELMCONFIG_DecodeWinType("Blackman", 4), 4);
    for (int v : {0, 1, 3, 4, 5, 6, 7}) EXPECT_EQ(VELMCONFIG_DecodeWinType(VELMCONFIG_EncodeWinType(v), -1), v);
    EXPECT_EQ(VELMCONFIG_DecodeColorScheme("invgrayscale", nullptr), &VELMCOLORMAP_INVGRAYSCALE);
    EXPECT_STREQ(VELMCONFIG_EncodeColorScheme(&VELMCOLORMAP_CE2K), "ce2k");
    EXPECT_STREQ(VELMCONFIG_EncodeColorScheme(nullptr), "undef");
}

TEST(ConfigDrawRecords, FontsAndColoursFill)
{
    VELMDRAWCONFIG c{};
    ASSERT_EQ(VELMCONFIG_InitDrawConfig(&c), 1);
    EXPECT_STREQ(c.scaleFont.familyName, "Tahoma");
    EXPECT_FLOAT_EQ(c.scaleFont.size, 6.5f);
    EXPECT_EQ(c.scaleFont.properties, 0x80);
    EXPECT_EQ(c.scaleFont.color, 0x7F7F7Fu);
    EXPECT_FLOAT_EQ(c.regionTextFont.size, 7.5f); // 10 x 0.75
    EXPECT_STREQ(c.phoneticTextFont.familyName, "Doulos SIL");
    EXPECT_EQ(c.windowBgColor, 0x404000u);
    EXPECT_EQ(c.whiteTransparency, 0x80FFFFFFu);
    EXPECT_EQ(c.mainCursorDrawShadow, 1);
    EXPECT_EQ(c.regionFocusBorderColor, 0xB0B0B0u);
    EXPECT_EQ(VELMCONFIG_InitDrawConfig(nullptr), 0);

    VELMDISPLAYDRAWCONFIG d{};
    ASSERT_EQ(VELMCONFIG_InitDisplayDrawConfig(&d), 1);
    EXPECT_STREQ(d.infoFont.familyName, "Arial");
    EXPECT_EQ(d.gradientOn[2], 0x404000u);
    EXPECT_EQ(d.mainFont.color, 0x0098ECu);
}

TEST(ConfigApply, PresetAndScaleKindsReachTheState)
{
    VELMSTATE *s = VELMSTATE_Create();
    ASSERT_TRUE(BLSETTINGS_ChangeEx(nullptr, "libvelm.spectral.preset=wide"));
    ASSERT_TRUE(BLSETTINGS_ChangeEx(nullptr, "libvelm.draw.horzscalekind=frm_view"));
    ASSERT_EQ(VELMCONFIG_ApplyStateConfiguration(nullptr, s), 1);
    EXPECT_EQ(s->spectral.windowSize, 40);
    EXPECT_EQ(s->spectral.fftLength, 256);
    EXPECT_EQ(s->spectral.colorScheme, &VELMCOLORMAP_GRAYSCALE);
    EXPECT_EQ(s->horzScaleKind, 5);
    EXPECT_TRUE(s->status & STATUS_VISUAL_CHANGED);

    // Nothing changed since: the second application returns at once.
    s->status = 0;
    s->horzScaleKind = 2;
    ASSERT_EQ(VELMCONFIG_ApplyStateConfiguration(nullptr, s), 1);
    EXPECT_EQ(s->horzScaleKind, 2);

    // A mistyped value leaves the state as it was.
    ASSERT_TRUE(BLSETTINGS_ChangeEx(nullptr, "libvelm.spectral.wide.wintype=Blackman"));
    s->spectral.windowType = 4;
    ASSERT_EQ(VELMCONFIG_ApplyStateConfiguration(nullptr, s), 1);
    EXPECT_EQ(s->spectral.windowType, 4);

    BLSETTINGS_DeleteEx(nullptr, "libvelm.spectral.wide.wintype");
    BLSETTINGS_DeleteEx(nullptr, "libvelm.spectral.preset");
    BLSETTINGS_DeleteEx(nullptr, "libvelm.draw.horzscalekind");
    VELMSTATE_Destroy(s);
    EXPECT_EQ(VELMCONFIG_ApplyStateConfiguration(nullptr, nullptr), 0);
}
