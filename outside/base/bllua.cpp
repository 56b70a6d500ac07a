/* Lua support: type and module registration, status answers, the library's module. */
#include "outside/base/bllua.h"

namespace {

int Version(lua_State *L)
{
    const char *name = luaL_checkstring(L, 1);
    char text[256];
    if (!BLVERSION_String(name, text, sizeof text)) return L_Return_ReturnStatus(L, 0, "unknown component");
    lua_pushstring(L, text);
    return 1;
}

int GetSetting(lua_State *L)
{
    const char *text = BLSETTINGS_GetStringEx(nullptr, "%s", luaL_checkstring(L, 1));
    if (!text) return L_Return_ReturnStatus(L, 0, "malformed key");
    lua_pushstring(L, text);
    return 1;
}

int SetSetting(lua_State *L)
{
    return L_Return_ReturnStatus(L, BLSETTINGS_ChangeEx(nullptr, "%s", luaL_checkstring(L, 1)),
                                 "unchanged or malformed setting");
}

int Log(lua_State *L)
{
    const int level = static_cast<int>(luaL_checkinteger(L, 1));
    BLDEBUG_Log(level, "%s", luaL_checkstring(L, 2));
    return 0;
}

const luaL_Reg module_functions[] = {
    {"version", Version},
    {"getsetting", GetSetting},
    {"setsetting", SetSetting},
    {"log", Log},
    {nullptr, nullptr},
};

} // namespace

int L_RegisterType(lua_State *L, const char *type_name, const luaL_Reg *methods)
{
    if (!L || !type_name) return 0;
    luaL_newmetatable(L, type_name);
    lua_pushvalue(L, -1);
    lua_setfield(L, -2, "__index");
    if (methods) luaL_register(L, nullptr, methods);
    lua_pop(L, 1);
    return 1;
}

int L_Return_ReturnStatus(lua_State *L, int status, const char *failure_text)
{
    if (!L) return 0;
    if (status) {
        lua_pushboolean(L, 1);
        return 1;
    }
    lua_pushnil(L);
    lua_pushstring(L, failure_text ? failure_text : "failed");
    return 2;
}

int L_OpenModule(lua_State *L, const char *name, const luaL_Reg *functions)
{
    if (!L || !name || !functions) return 0;
    luaL_register(L, name, functions);
    return 1;
}

int luaopen_libvelmbase(lua_State *L)
{
    return L_OpenModule(L, "libvelmbase", module_functions);
}
