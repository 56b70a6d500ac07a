// Conversion of the library's texts: Latin-1 bytes and phonetic escapes.
#include "render/canvas/qt/qtcanvas_internal.h"

#include <gtest/gtest.h>

using velm::canvas::qt::_Convert2QString;

namespace {

TEST(TextConversion, PlainBytesAreLatin1)
{
    EXPECT_EQ(_Convert2QString("abc"), QString("abc"));
    EXPECT_EQ(_Convert2QString("\xE9t\xE9"), QString::fromUtf8("été"));
    EXPECT_EQ(_Convert2QString(""), QString());
}

TEST(TextConversion, EscapesGivePhoneticSymbols)
{
    EXPECT_EQ(_Convert2QString("\\c,a"), QString::fromUtf8("ça"));
    EXPECT_EQ(_Convert2QString("\\shi\\:f p"), QString::fromUtf8("\u0283i\u02D0 p"));
    EXPECT_EQ(_Convert2QString("\\'1ba\\bs"), QString::fromUtf8("\u02C8ba\\"));
    EXPECT_EQ(_Convert2QString("\\|f\\`^"), QString::fromUtf8("|\u0300"));
    EXPECT_EQ(_Convert2QString("\\~^\\O."), QString::fromUtf8("\u0303\u0298"));
}

TEST(TextConversion, UnknownAndCutEscapesGiveQuestionMarks)
{
    EXPECT_EQ(_Convert2QString("\\zz"), QString("?"));
    EXPECT_EQ(_Convert2QString("a\\z"), QString("a?"));
    EXPECT_EQ(_Convert2QString("a\\"), QString("a"));
}

TEST(TextConversion, ABackslashApostropheBeforeABreakIsAModifierApostrophe)
{
    EXPECT_EQ(_Convert2QString("a\\' b"), QString::fromUtf8("a\u02BC b"));
    EXPECT_EQ(_Convert2QString("a\\'\nb"), QString::fromUtf8("a\u02BC\nb"));
    EXPECT_EQ(_Convert2QString("a\\'"), QString::fromUtf8("a\u02BC"));
}

} // namespace
