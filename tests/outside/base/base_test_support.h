// Helpers shared by the base services tests: a started library per test and a
// log sink that collects messages.
#pragma once

#include "outside/base/blbase.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

// Each test starts the library and ends with the last finalize, so no state
// leaks from one test into the next.
class BaseTest : public ::testing::Test {
protected:
    void SetUp() override { ASSERT_EQ(BLCORE_Initialize(), 1); }
    void TearDown() override
    {
        BLDEBUG_SetSink(nullptr, nullptr);
        while (BLCORE_IsInitialized()) BLCORE_Finalize();
    }
};

// Collects what the log says while it lives.
class LogCapture {
public:
    LogCapture() { BLDEBUG_SetSink(&LogCapture::Collect, this); }
    ~LogCapture() { BLDEBUG_SetSink(nullptr, nullptr); }

    struct Message {
        int kind;
        std::string text;
    };
    std::vector<Message> messages;

private:
    static void Collect(int kind, int, const char *text, void *user)
    {
        static_cast<LogCapture *>(user)->messages.push_back({kind, text});
    }
};
