// The "libvelm" Lua module in a host that embeds Lua: open, new and save
// round trips with real files, argument errors, and collection.
#include "core/velmaudio.h"
#include "persist/velmlua.h"
#include "testaudio.hpp"

#include <gtest/gtest.h>
#include <lua5.1/lua.hpp>

#include <string>

namespace {

// A Lua state where require "libvelm" finds the module.
class LuaTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(velmtest::write_audio(input, velmtest::sine(RATE, 2, FRAMES), RATE, 2));
        L = luaL_newstate();
        luaL_openlibs(L);
        lua_getglobal(L, "package");
        lua_getfield(L, -1, "preload");
        lua_pushcfunction(L, luaopen_libvelm);
        lua_setfield(L, -2, "libvelm");
        lua_pop(L, 2);
        set("IN", input);
        ASSERT_EQ(run("libvelm = require 'libvelm'"), "");
    }
    void TearDown() override { close(); }

    void close()
    {
        if (L) lua_close(L);
        L = nullptr;
    }

    void set(const char *name, const std::string &value)
    {
        lua_pushlstring(L, value.data(), value.size());
        lua_setglobal(L, name);
    }

    std::string global(const char *name)
    {
        lua_getglobal(L, name);
        size_t length = 0;
        const char *text = lua_tolstring(L, -1, &length);
        std::string out = text ? std::string(text, length) : "<nil>";
        lua_pop(L, 1);
        return out;
    }

    // Runs a chunk; "" when it ran through, else the Lua error message.
    std::string run(const std::string &chunk)
    {
        if (luaL_loadstring(L, chunk.c_str()) != 0 || lua_pcall(L, 0, 0, 0) != 0) {
            std::string error = lua_tostring(L, -1);
            lua_pop(L, 1);
            return error;
        }
        return "";
    }

    static constexpr int RATE = 22050;
    static constexpr int FRAMES = 4410;
    velmtest::TempDir dir;
    std::string input = dir.file("in.wav");
    lua_State *L = nullptr;
};

TEST_F(LuaTest, RequireRegistersTheModuleTheTypeAndTheBaseModule)
{
    ASSERT_EQ(run("assert(type(libvelm.open) == 'function' and type(libvelm.new) == 'function')\n"
                  "assert(package.loaded.libvelm == libvelm)\n"
                  "assert(type(libvelmbase) == 'table' and type(libvelmbase.version) == 'function')"),
              "");
    luaL_getmetatable(L, "KORVA.libvelm.VELMAUDIO");
    ASSERT_TRUE(lua_istable(L, -1));
    for (const char *method : {"save", "__gc", "__tostring"}) {
        lua_getfield(L, -1, method);
        EXPECT_TRUE(lua_iscfunction(L, -1)) << method;
        lua_pop(L, 1);
    }
    lua_pop(L, 1);
}

TEST_F(LuaTest, OpenSaveAndReopenKeepTheSound)
{
    set("FLAC", dir.file("out.flac"));
    set("WIDE", dir.file("wide.wav"));
    ASSERT_EQ(run("local doc, err = libvelm.open(IN)\n"
                  "assert(doc and err == nil)\n"
                  "assert(doc:save(FLAC) == true)\n"
                  "assert(doc:save() == true)\n"
                  "assert(doc:save(WIDE, 'WAVE[nbits=24]') == true)\n"
                  "local again, e2 = libvelm.open(FLAC, 'AUTO')\n"
                  "assert(again and e2 == nil)\n"
                  "assert(again:save(FLAC .. '.wav'))\n"),
              "");
    const auto original = velmtest::read_audio(input);
    for (const char *name : {"out.flac", "wide.wav", "out.flac.wav"}) {
        int rate = 0, channels = 0;
        const auto copy = velmtest::read_audio(dir.file(name), &rate, &channels);
        EXPECT_EQ(rate, RATE) << name;
        EXPECT_EQ(channels, 2) << name;
        ASSERT_EQ(copy.size(), original.size()) << name;
        for (size_t i = 0; i < copy.size(); i += 97) ASSERT_NEAR(copy[i], original[i], 1e-4) << name << " at " << i;
    }
}

TEST_F(LuaTest, NewMakesTheAskedFormat)
{
    struct Case {
        const char *call;
        int rate, channels;
    } cases[] = {
        {"libvelm:new()", 8000, 1},
        {"libvelm.new()", 8000, 1},
        {"libvelm:new('AUTO[sr=44100,nc=2]')", 44100, 2},
        {"libvelm.new(nil, 'WAVE[nc=3,sr=16000,nbits=24]')", 16000, 3},
    };
    int n = 0;
    for (const Case &c : cases) {
        const std::string path = dir.file("new" + std::to_string(n++) + ".wav");
        set("OUT", path);
        ASSERT_EQ(run("local doc, err = " + std::string(c.call) + "\nassert(doc and err == nil)\nassert(doc:save(OUT))"), "")
            << c.call;
        int rate = 0, channels = 0;
        velmtest::read_audio(path, &rate, &channels);
        EXPECT_EQ(rate, c.rate) << c.call;
        EXPECT_EQ(channels, c.channels) << c.call;
    }
}

TEST_F(LuaTest, FailuresAnswerNilAndTheMessage)
{
    set("MISSING", dir.file("missing.wav"));
    set("NOFOLDER", dir.file("no/folder/x.wav"));
    ASSERT_EQ(run("local doc, err = libvelm.open(MISSING)\n"
                  "assert(doc == nil and err == 'Unable to open VELMAUDIO.', tostring(err))\n"
                  "for _, bad in ipairs({'AUTO[sr=abc]', 'AUTO[nc=100000]', 'AUTO[sr=8000', 'AUTO[colour=red]', '', "
                  "'[sr=8000]', 'AUTO[sr=-5]'}) do\n"
                  "  local d, e = libvelm:new(bad)\n"
                  "  assert(d == nil and e == 'Unable to open VELMAUDIO.', bad)\n"
                  "end\n"
                  "local untitled = libvelm:new()\n"
                  "local ok, msg = untitled:save()\n"
                  "assert(ok == nil and msg == 'Unable to save VELMAUDIO')\n"
                  "ok, msg = untitled:save(NOFOLDER)\n"
                  "assert(ok == nil and msg == 'Unable to save VELMAUDIO')\n"
                  "ok, msg = untitled:save(IN .. '.wav', 'NOSUCHTYPE')\n"
                  "assert(ok == nil and msg == 'Unable to save VELMAUDIO')\n"),
              "");
}

TEST_F(LuaTest, WrongArgumentsRaiseTheStandardErrors)
{
    struct Case {
        const char *call, *message;
    } cases[] = {
        {"libvelm.open()", "bad argument #1 to 'open' (string expected, got no value)"},
        {"libvelm.open({})", "bad argument #1 to 'open' (string expected, got table)"},
        {"libvelm.open(IN, {})", "bad argument #2 to 'open' (string expected, got table)"},
        {"libvelm:new({})", "bad argument #2 to 'new' (string expected, got table)"},
        {"local d = libvelm:new(); d.save({})", "bad argument #1 to 'save' (KORVA.libvelm.VELMAUDIO expected, got table)"},
        {"local d = libvelm:new(); d:save({})", "bad argument #1 to 'save' (string expected, got table)"},
        {"local d = libvelm:new(); d:save('x.wav', true)", "bad argument #2 to 'save' (string expected, got boolean)"},
        {"local d = libvelm:new(); getmetatable(d).__tostring(io.stdout)",
         "bad argument #1 to '__tostring' (KORVA.libvelm.VELMAUDIO expected, got userdata)"},
        {"local d = libvelm:new(); getmetatable(d).__gc(42)", "bad argument #1 to '__gc' (KORVA.libvelm.VELMAUDIO expected, got number)"},
    };
    for (const Case &c : cases) {
        const std::string error = run(c.call);
        EXPECT_NE(error.find("bad argument"), std::string::npos) << c.call << ": " << error;
        // Lua names the function only when it can see how it was called.
        EXPECT_NE(error.find(std::string(c.message).substr(std::string(c.message).find('('))), std::string::npos)
            << c.call << ": " << error;
    }
}

TEST_F(LuaTest, ObjectsPrintTheirDocument)
{
    ASSERT_EQ(run("text = tostring(libvelm.open(IN))"), "");
    EXPECT_EQ(global("text").rfind("VELMAUDIO object at 0x", 0), 0u) << global("text");
}

TEST_F(LuaTest, CollectionClosesEachDocumentOnce)
{
    const int before = CountRegisteredObjects();
    ASSERT_EQ(run("kept = libvelm.open(IN)\nextra = libvelm:new()"), "");
    EXPECT_EQ(CountRegisteredObjects(), before + 2);

    testing::internal::CaptureStderr();
    ASSERT_EQ(run("extra = nil\ncollectgarbage()\ncollectgarbage()"), "");
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "I have been collected!\n");
    EXPECT_EQ(CountRegisteredObjects(), before + 1);

    // A collector called by hand closes the document once; later calls and
    // the final collection find the slot empty.
    testing::internal::CaptureStderr();
    ASSERT_EQ(run("local gc = getmetatable(kept).__gc\ngc(kept)\ngc(kept)\nassert(kept:save() == nil)"), "");
    EXPECT_EQ(CountRegisteredObjects(), before);
    close();
    EXPECT_EQ(testing::internal::GetCapturedStderr(), "I have been collected!\nI have been collected!\nI have been collected!\n");
    EXPECT_EQ(CountRegisteredObjects(), before);
}

TEST_F(LuaTest, AScriptErrorLeaksNoDocument)
{
    const int before = CountRegisteredObjects();
    const std::string error = run("local a = libvelm.open(IN)\nlocal b = libvelm:new()\nerror('stopped here')");
    EXPECT_NE(error.find("stopped here"), std::string::npos);
    testing::internal::CaptureStderr();
    close();
    testing::internal::GetCapturedStderr();
    EXPECT_EQ(CountRegisteredObjects(), before);
}

} // namespace
