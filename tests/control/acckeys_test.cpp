#include "control/velmacckeys.h"
#include "render/canvas/velmcanvas.h"

#include <gtest/gtest.h>

TEST(AccKeys, EachShellBitMapsToItsFlags)
{
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0), 0u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x01), 0x20u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x02), 0x80u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x04), 0x08u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x08), 0x02u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x10), 0x40u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x20), 0x05u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x40), 0x01u);
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x09), 0x22u); // bits combine
    EXPECT_EQ(VELMDEFINES_TranslateAccKeys(0x80000000u), 0u); // unknown bits give nothing
}

TEST(AccKeys, TheCanvasAndDocumentEntriesForward)
{
    for (uint32_t keys : {0x01u, 0x14u, 0x7Fu}) {
        EXPECT_EQ(VELMCANVAS_TranslateAccKeys(keys), VELMDEFINES_TranslateAccKeys(keys));
        EXPECT_EQ(VELMAUDIO_TranslateAccKeys(keys), VELMDEFINES_TranslateAccKeys(keys));
    }
}
