#include "base_test_support.h"

#include <string>
#include <thread>
#include <vector>

using Settings = BaseTest;

TEST_F(Settings, ValuesAndDefaultsThroughTheGlobalRegistry)
{
    EXPECT_EQ(BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.hovertime=%d", 500), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 500);
    EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, "libvelm.draw.hovertime=%d", 250), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 250);
    // A default registered later never overrides the user's value.
    EXPECT_EQ(BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.hovertime=%d", 900), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 250);
    // Deleting the value brings the default back.
    EXPECT_EQ(BLSETTINGS_DeleteEx(nullptr, "libvelm.draw.hovertime"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 900);
    EXPECT_EQ(BLSETTINGS_DeleteEx(nullptr, "libvelm.draw.hovertime"), 0);
    EXPECT_EQ(BLSETTINGS_ExistsEx(nullptr, "libvelm.draw.hovertime"), 1);
    EXPECT_EQ(BLSETTINGS_ExistsEx(nullptr, "libvelm.draw.nothing"), 0);
}

TEST_F(Settings, ChangeReportsWhetherTheValueChanged)
{
    EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, "a.b=1"), 1);
    EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, "a.b = 1 "), 0) << "same value after trimming";
    EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, "A.B=2"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "a.b"), 2);
}

TEST_F(Settings, KeysIgnoreCase)
{
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.regiontextfont.size=%d", 9);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.RegionTextFont.Size"), 9);
    BLSETTINGS_ChangeEx(nullptr, "LIBVELM.DRAW.REGIONTEXTFONT.SIZE=11");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.regiontextfont.size"), 11);
    EXPECT_EQ(BLSETTINGS_ExistsEx(nullptr, "Libvelm.Draw.RegionTextFont.Size"), 1);
}

TEST_F(Settings, BracketedReadsFallBackInOrder)
{
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.spectral.%s.fftlen=[%d]", "narrow", 512), 512);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset=[narrow]"), "narrow");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset"), "");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.missing"), 0);
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "libvelm.missing"), 0.0);
    EXPECT_EQ(BLSETTINGS_GetBoolEx(nullptr, "libvelm.missing"), 0);

    // A registered default beats the bracketed one; a value beats both.
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.spectral.preset=wide");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset=[narrow]"), "wide");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset"), "wide");
    BLSETTINGS_ChangeEx(nullptr, "libvelm.spectral.preset=custom");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "libvelm.spectral.preset=[narrow]"), "custom");
    // Brackets are kept inside the default: a vector text survives.
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "x.vector=[[1,2]]"), "[1,2]");
}

TEST_F(Settings, TypedReads)
{
    BLSETTINGS_ChangeEx(nullptr, "t.float=%f", 0.25);
    BLSETTINGS_ChangeEx(nullptr, "t.colour=%d", static_cast<int>(0xFF404000u));
    BLSETTINGS_ChangeEx(nullptr, "t.hex=0xFF404000");
    BLSETTINGS_ChangeEx(nullptr, "t.word=abc");
    BLSETTINGS_SetDefaultEx(nullptr, "t.fade=[%f]", 0.1);
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "t.float"), 0.25);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "t.colour"), static_cast<int>(0xFF404000u));
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "t.hex"), static_cast<int>(0xFF404000u));
    EXPECT_DOUBLE_EQ(BLSETTINGS_GetFloatEx(nullptr, "t.fade"), 0.1);
    // A value that is not a number gives way to the defaults.
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "t.word=[7]"), 7);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "t.word"), 0);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "t.word=[7]"), "abc");

    const char *yes[] = {"1", "true", "TRUE", "yes", "on", "On", "5"};
    const char *no[] = {"0", "false", "no", "off", "OFF"};
    for (const char *text : yes) {
        BLSETTINGS_ChangeEx(nullptr, "t.flag=%s", text);
        EXPECT_EQ(BLSETTINGS_GetBoolEx(nullptr, "t.flag=[0]"), 1) << text;
    }
    for (const char *text : no) {
        BLSETTINGS_ChangeEx(nullptr, "t.flag=%s", text);
        EXPECT_EQ(BLSETTINGS_GetBoolEx(nullptr, "t.flag=[1]"), 0) << text;
    }
}

TEST_F(Settings, InsertedObjectsOverlayTheGlobalRegistry)
{
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.color=%d", 1);
    BLSETTINGS_ChangeEx(nullptr, "libvelm.draw.width=%d", 10);
    BLSETTINGS doc = BLSETTINGS_Create();
    BLSETTINGS later = BLSETTINGS_Create();
    ASSERT_NE(doc, nullptr);
    BLSETTINGS_ChangeEx(doc, "libvelm.draw.color=%d", 2);
    BLSETTINGS_ChangeEx(later, "libvelm.draw.color=%d", 3);
    BLSETTINGS_SetDefaultEx(later, "libvelm.draw.height=%d", 40);

    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.color"), 1) << "not inserted yet";
    EXPECT_EQ(BLSETTINGS_Insert(doc), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.color"), 2);
    EXPECT_EQ(BLSETTINGS_Insert(later), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.color"), 3) << "last inserted first";
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.width"), 10) << "falls through";
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.height"), 40);
    // Reads through an object see that object only.
    EXPECT_EQ(BLSETTINGS_GetIntEx(doc, "libvelm.draw.width"), 0);
    EXPECT_EQ(BLSETTINGS_ExistsEx(doc, "libvelm.draw.width"), 0);

    EXPECT_EQ(BLSETTINGS_Remove(later), 1);
    EXPECT_EQ(BLSETTINGS_Remove(later), 0);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.color"), 2);
    // Destroying an inserted object takes it out of the chain.
    EXPECT_EQ(BLSETTINGS_Destroy(doc), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.color"), 1);
    EXPECT_EQ(BLSETTINGS_Destroy(doc), 0) << "a destroyed handle is refused";
    EXPECT_EQ(BLSETTINGS_Insert(doc), 0);
    EXPECT_EQ(BLSETTINGS_Destroy(later), 1);
}

TEST_F(Settings, GlobalStampGrowsOnEveryVisibleChange)
{
    BLSETTINGS doc = BLSETTINGS_Create();
    uint64_t stamp = BLSETTINGS_GetTimeStampEx(nullptr);
    const auto grew = [&] {
        const uint64_t now = BLSETTINGS_GetTimeStampEx(nullptr);
        const bool result = now > stamp;
        stamp = now;
        return result;
    };
    BLSETTINGS_ChangeEx(nullptr, "s.a=1");
    EXPECT_TRUE(grew());
    BLSETTINGS_ChangeEx(nullptr, "s.a=1");
    EXPECT_FALSE(grew()) << "no change, no new stamp";
    BLSETTINGS_SetDefaultEx(nullptr, "s.b=1");
    EXPECT_TRUE(grew());
    BLSETTINGS_ChangeEx(doc, "s.a=2");
    EXPECT_FALSE(grew()) << "an object outside the chain";
    EXPECT_GT(BLSETTINGS_GetTimeStampEx(doc), 0u);
    BLSETTINGS_Insert(doc);
    EXPECT_TRUE(grew()) << "inserting changes what the registry reads";
    BLSETTINGS_ChangeEx(doc, "s.a=3");
    EXPECT_TRUE(grew());
    BLSETTINGS_Remove(doc);
    EXPECT_TRUE(grew());
    BLSETTINGS_Destroy(doc);
}

TEST_F(Settings, SecretValuesReadPlainOnlyThroughTheSecretCall)
{
    EXPECT_EQ(BLSETTINGS_ChangeSecretEx(nullptr, "net.password=%s", "hunter2"), 1);
    EXPECT_STREQ(BLSETTINGS_GetSecretStringEx(nullptr, "net.password"), "hunter2");
    const std::string shown = BLSETTINGS_GetStringEx(nullptr, "net.password");
    EXPECT_EQ(shown.find("hunter2"), std::string::npos);
    EXPECT_FALSE(shown.empty());
    BLSETTINGS_ChangeEx(nullptr, "net.user=anna");
    EXPECT_STREQ(BLSETTINGS_GetSecretStringEx(nullptr, "net.user"), "anna");
}

TEST_F(Settings, MalformedTextsAndHandlesFail)
{
    LogCapture log;
    const char *malformed[] = {"no equals sign", "=value", "bad[key]=1", "line\nbreak=1",
                               "trailing.=1", ".leading=1", ";comment=1", "a. spaced=1"};
    for (const char *text : malformed) {
        EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, "%s", text), 0) << text;
        EXPECT_EQ(BLSETTINGS_SetDefaultEx(nullptr, "%s", text), 0) << text;
    }
    EXPECT_EQ(BLSETTINGS_ChangeEx(nullptr, nullptr), 0);
    EXPECT_EQ(BLSETTINGS_GetStringEx(nullptr, nullptr), nullptr);
    EXPECT_EQ(BLSETTINGS_GetStringEx(nullptr, "=[x]"), nullptr);
    EXPECT_FALSE(log.messages.empty()) << "malformed settings are reported";
    EXPECT_EQ(BLSETTINGS_Destroy(nullptr), 0);
    EXPECT_EQ(BLSETTINGS_Insert(nullptr), 0);
    EXPECT_EQ(BLSETTINGS_Remove(nullptr), 0);
    EXPECT_EQ(BLSETTINGS_SetConfigFileEx(nullptr, nullptr, "ini"), 0);
    EXPECT_EQ(BLSETTINGS_SetConfigFileEx(nullptr, "/tmp/x.ini", "xml"), 0);
}

TEST_F(Settings, TextsStayValidUntilFinalize)
{
    BLSETTINGS_ChangeEx(nullptr, "k.text=first");
    const char *first = BLSETTINGS_GetStringEx(nullptr, "k.text");
    BLSETTINGS_ChangeEx(nullptr, "k.text=second");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(nullptr, "k.text"), "second");
    EXPECT_STREQ(first, "first") << "an earlier answer is not overwritten";
}

TEST(SettingsFinalize, LastFinalizeClearsTheRegistry)
{
    BLCORE_Initialize();
    BLSETTINGS doc = BLSETTINGS_Create();
    BLSETTINGS_ChangeEx(doc, "f.x=1");
    BLSETTINGS_Insert(doc);
    BLSETTINGS_ChangeEx(nullptr, "f.y=2");
    const uint64_t before = BLSETTINGS_GetTimeStampEx(nullptr);
    BLCORE_Finalize();
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "f.y"), 0);
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "f.x"), 0) << "the chain is emptied";
    EXPECT_GT(BLSETTINGS_GetTimeStampEx(nullptr), before);
    EXPECT_EQ(BLSETTINGS_GetIntEx(doc, "f.x"), 1) << "objects belong to their creators";
    EXPECT_EQ(BLSETTINGS_Destroy(doc), 1);
}

TEST_F(Settings, ConcurrentChangesAndReadsStayConsistent)
{
    BLSETTINGS doc = BLSETTINGS_Create();
    std::vector<std::thread> workers;
    for (int t = 0; t < 4; ++t)
        workers.emplace_back([t, doc] {
            for (int i = 0; i < 300; ++i) {
                BLSETTINGS_ChangeEx(nullptr, "par.thread%d=%d", t, i);
                BLSETTINGS_ChangeEx(doc, "par.shared=%d", i);
                if (i % 50 == 0) BLSETTINGS_Insert(doc);
                if (i % 50 == 25) BLSETTINGS_Remove(doc);
                const int seen = BLSETTINGS_GetIntEx(nullptr, "par.thread%d", t);
                ASSERT_EQ(seen, i) << "a thread reads its own last value";
                BLSETTINGS_GetStringEx(nullptr, "par.shared=[none]");
            }
        });
    for (auto &w : workers) w.join();
    EXPECT_EQ(BLSETTINGS_GetIntEx(doc, "par.shared"), 299);
    BLSETTINGS_Destroy(doc);
}
