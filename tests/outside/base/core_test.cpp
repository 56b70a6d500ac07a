#include "base_test_support.h"

#include <cstdio>
#include <fstream>
#include <sstream>
#include <string>
#include <vector>

namespace {

std::vector<void *> disposed;

int Dispose(void *object)
{
    disposed.push_back(object);
    UnRegisterObject(object);
    return 1;
}

std::string ReadAll(const std::string &path)
{
    std::ifstream in(path);
    std::stringstream text;
    text << in.rdbuf();
    return text.str();
}

} // namespace

TEST(StartUp, NestedStartsNeedAsManyFinalizes)
{
    ASSERT_FALSE(BLCORE_IsInitialized());
    BLCORE_Initialize();
    BLCORE_Initialize();
    BLCORE_Finalize();
    EXPECT_TRUE(BLCORE_IsInitialized());
    BLCORE_Finalize();
    EXPECT_FALSE(BLCORE_IsInitialized());
    BLCORE_Finalize(); // one too many does nothing
    EXPECT_FALSE(BLCORE_IsInitialized());
}

TEST(StartUp, LastFinalizeDisposesRegisteredObjects)
{
    int a = 0, b = 0, c = 0;
    disposed.clear();
    BLCORE_Initialize();
    BLCORE_Initialize();
    EXPECT_EQ(RegisterObject(&a, 0, Dispose), 1);
    EXPECT_EQ(RegisterObject(&a, 0, Dispose), 0) << "registered once";
    EXPECT_EQ(RegisterObject(&b, 0, Dispose), 1);
    EXPECT_EQ(RegisterObject(&c, 0, nullptr), 1);
    EXPECT_EQ(UnRegisterObject(&b), 1);
    EXPECT_FALSE(IsRegisteredObject(&b));
    EXPECT_TRUE(IsRegisteredObject(&a));
    EXPECT_EQ(CountRegisteredObjects(), 2);

    BLCORE_Finalize();
    EXPECT_TRUE(disposed.empty()) << "only the last finalize disposes";
    BLCORE_Finalize();
    EXPECT_EQ(disposed, std::vector<void *>{&a});
    EXPECT_EQ(CountRegisteredObjects(), 0);
    EXPECT_FALSE(IsRegisteredObject(&c));
    EXPECT_EQ(RegisterObject(nullptr, 0, Dispose), 0);
    EXPECT_EQ(UnRegisterObject(nullptr), 0);
}

using Versions = BaseTest;

TEST_F(Versions, RegisteredVersionReadsBack)
{
    char text[64];
    EXPECT_EQ(BLVERSION_Register("libvelm", 2, 6, 0, 2985), 1);
    ASSERT_EQ(BLVERSION_String("libvelm", text, sizeof text), 1);
    EXPECT_STREQ(text, "libvelm 2.6.0.2985");
    EXPECT_EQ(BLVERSION_String("unknown", text, sizeof text), 0);
    EXPECT_EQ(BLVERSION_Register(nullptr, 1, 0, 0, 0), 0);
    BLCORE_Finalize();
    EXPECT_EQ(BLVERSION_String("libvelm", text, sizeof text), 0) << "finalize forgets versions";
}

using Logging = BaseTest;

TEST_F(Logging, SinkSeesKeptMessagesOnly)
{
    LogCapture log;
    BLDEBUG_SetLevel(BLDEBUG_LEVEL_INFO);
    BLDEBUG_Log(0, "plain %d", 1);
    BLDEBUG_Log(5, "too detailed");
    BLDEBUG_Warning(-1, "careful %s\n", "there");
    BLDEBUG_Error(-1, "broken");
    BLDEBUG_TerminalError(-1, "fatal");
    ASSERT_EQ(log.messages.size(), 4u);
    EXPECT_EQ(log.messages[0].text, "plain 1");
    EXPECT_EQ(log.messages[1].kind, BLDEBUG_KIND_WARNING);
    EXPECT_EQ(log.messages[1].text, "careful there") << "a trailing newline is dropped";
    EXPECT_EQ(log.messages[2].kind, BLDEBUG_KIND_ERROR);
    EXPECT_EQ(log.messages[3].kind, BLDEBUG_KIND_TERMINAL);

    BLDEBUG_SetLevel(BLDEBUG_LEVEL_NONE);
    BLDEBUG_Error(-1, "silenced");
    EXPECT_EQ(log.messages.size(), 4u);
    EXPECT_EQ(BLDEBUG_GetLevel(), BLDEBUG_LEVEL_NONE);
    BLDEBUG_SetLevel(BLDEBUG_LEVEL_INFO);
}

TEST_F(Logging, WindowsSizePrefixReadsAs64Bit)
{
    LogCapture log;
    const int64_t before = 5000000000, after = 3000000000;
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wformat"
#pragma GCC diagnostic ignored "-Wformat-extra-args"
    BLDEBUG_Log(-1, "Size change: %I64d -> %I64d (%d bytes freed) %5I64u%%", before, after, 7,
                static_cast<uint64_t>(42));
#pragma GCC diagnostic pop
    ASSERT_EQ(log.messages.size(), 1u);
    EXPECT_EQ(log.messages[0].text, "Size change: 5000000000 -> 3000000000 (7 bytes freed)    42%");
}

TEST_F(Logging, FileDestinationAppendsLines)
{
    const std::string path = std::string(VELM_TEST_BINARY_DIR) + "/logging_test.log";
    std::remove(path.c_str());
    BLDEBUG_Log(0, "before any destination");
    ASSERT_EQ(BLDEBUG_SetLogFile(path.c_str()), 1);
    BLDEBUG_Log(0, "first");
    BLDEBUG_Error(-1, "second %d", 2);
    EXPECT_EQ(BLDEBUG_SetLogFile(nullptr), 1);
    BLDEBUG_Log(0, "after closing");
    EXPECT_EQ(ReadAll(path), "first\nERROR: second 2\n");
    EXPECT_EQ(BLDEBUG_SetLogFile("/nonexistent-folder/x.log"), 0);
    std::remove(path.c_str());
}
