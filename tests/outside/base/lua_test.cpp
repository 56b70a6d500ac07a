#include "base_test_support.h"
#include "outside/base/bllua.h"

#include <string>

namespace {

// A Lua state with the standard libraries and the base module opened.
class Lua : public BaseTest {
protected:
    void SetUp() override
    {
        BaseTest::SetUp();
        L = luaL_newstate();
        luaL_openlibs(L);
        lua_pushcfunction(L, luaopen_libvelmbase);
        lua_call(L, 0, 0);
    }
    void TearDown() override
    {
        lua_close(L);
        BaseTest::TearDown();
    }
    // Runs a chunk; its first result as text (or the error message).
    std::string Run(const char *chunk)
    {
        if (luaL_dostring(L, chunk) != 0) {
            std::string error = std::string("error: ") + lua_tostring(L, -1);
            lua_settop(L, 0);
            return error;
        }
        std::string result = lua_isnoneornil(L, 1) ? "nil" : luaL_checkstring(L, 1);
        lua_settop(L, 0);
        return result;
    }
    lua_State *L = nullptr;
};

const char *kCounterType = "TEST.Counter";

int CounterNew(lua_State *L)
{
    const int start = static_cast<int>(luaL_optinteger(L, 1, 0));
    *static_cast<int *>(lua_newuserdata(L, sizeof(int))) = start;
    lua_getfield(L, LUA_REGISTRYINDEX, kCounterType);
    lua_setmetatable(L, -2);
    return 1;
}

int CounterAdd(lua_State *L)
{
    int *slot = static_cast<int *>(luaL_checkudata(L, 1, kCounterType));
    const int step = static_cast<int>(luaL_checkinteger(L, 2));
    if (step < 0) return L_Return_ReturnStatus(L, 0, "Unable to count down");
    *slot += step;
    return L_Return_ReturnStatus(L, 1, "never shown");
}

int CounterValue(lua_State *L)
{
    lua_pushinteger(L, *static_cast<int *>(luaL_checkudata(L, 1, kCounterType)));
    return 1;
}

const luaL_Reg counter_methods[] = {{"add", CounterAdd}, {"value", CounterValue}, {nullptr, nullptr}};
const luaL_Reg counter_module[] = {{"new", CounterNew}, {nullptr, nullptr}};

int OpenCounter(lua_State *L)
{
    const int results = L_OpenModule(L, "counter", counter_module);
    L_RegisterType(L, kCounterType, counter_methods);
    return results;
}

} // namespace

TEST_F(Lua, TypesModulesAndStatusAnswers)
{
    const int top = lua_gettop(L);
    lua_pushcfunction(L, OpenCounter);
    lua_call(L, 0, 1);
    EXPECT_TRUE(lua_istable(L, -1)) << "the module table is returned";
    lua_settop(L, top);

    EXPECT_EQ(Run("local c = counter.new(2); local ok = c:add(3); return tostring(ok) .. c:value()"),
              "true5");
    EXPECT_EQ(Run("local c = counter.new(); local ok, why = c:add(-1); return tostring(ok) .. ' ' .. why"),
              "nil Unable to count down");
    EXPECT_EQ(Run("return getmetatable(counter.new()).__index == getmetatable(counter.new()) and 'same' or 'no'"),
              "same");
    // A method called on something else raises Lua's argument error.
    EXPECT_NE(Run("local c = counter.new(); return c.value({})").find("TEST.Counter expected"),
              std::string::npos);
}

TEST_F(Lua, HelpersRefuseNullArguments)
{
    EXPECT_EQ(L_RegisterType(nullptr, "x", counter_methods), 0);
    EXPECT_EQ(L_RegisterType(L, nullptr, counter_methods), 0);
    EXPECT_EQ(L_OpenModule(L, nullptr, counter_module), 0);
    EXPECT_EQ(L_Return_ReturnStatus(nullptr, 1, "x"), 0);
    EXPECT_EQ(L_Return_ReturnStatus(L, 0, nullptr), 2);
    EXPECT_STREQ(lua_tostring(L, -1), "failed");
    EXPECT_EQ(L_RegisterType(L, "TEST.Bare", nullptr), 1);
    EXPECT_EQ(lua_gettop(L), 2) << "registering a type leaves the stack alone";
}

TEST_F(Lua, BaseModuleReachesSettingsVersionsAndLog)
{
    BLVERSION_Register("libvelm", 2, 6, 0, 2985);
    EXPECT_EQ(Run("return libvelmbase.version('libvelm')"), "libvelm 2.6.0.2985");
    EXPECT_EQ(Run("local v, why = libvelmbase.version('nothing'); return why"), "unknown component");

    EXPECT_EQ(Run("return tostring(libvelmbase.setsetting('libvelm.lua.answer=42'))"), "true");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.lua.answer"), 42);
    EXPECT_EQ(Run("return tostring(libvelmbase.setsetting('libvelm.lua.answer=42'))"), "nil");
    EXPECT_EQ(Run("return libvelmbase.getsetting('libvelm.Lua.Answer')"), "42");
    EXPECT_EQ(Run("return libvelmbase.getsetting('libvelm.lua.other=[%d]')"), "%d")
        << "script texts are never used as formats";

    LogCapture log;
    Run("libvelmbase.log(0, 'from a script %s')");
    ASSERT_EQ(log.messages.size(), 1u);
    EXPECT_EQ(log.messages[0].text, "from a script %s");
}
