// The Lua module "libvelm": documents as userdata objects that own them.
#include "persist/velmlua.h"

#include <cstdio>
#include <cstring>

#include "core/velmaudio.h"
#include "outside/base/bllua.h"
#include "persist/format_text.hpp"

namespace {

const char *const TYPE_NAME = "KORVA.libvelm.VELMAUDIO";
const char *const OPEN_FAILED = "Unable to open VELMAUDIO.";

// The signal library has no word for "from the file name"; its "AUTO" on
// saving picks the file type from the name's extension.
const char *save_format(const char *format)
{
    return strcmp(format, "FROM_FORMAT") == 0 ? "AUTO" : format;
}

// Pushes the type's metatable and an object without a document.  Both are
// made before the document, so an out-of-memory error raised by Lua can
// never strand an open document.
VELMAUDIO *push_empty_object(lua_State *L)
{
    luaL_getmetatable(L, TYPE_NAME);
    auto *slot = static_cast<VELMAUDIO *>(lua_newuserdata(L, sizeof(VELMAUDIO)));
    *slot = nullptr;
    return slot;
}

// Answers the object and nil, or nil and the failure text.  The object gets
// its metatable (and so its collector) only when it holds a document.
int answer_object(lua_State *L, VELMAUDIO *slot, VELMAUDIO doc)
{
    if (!doc) {
        lua_pushnil(L);
        lua_pushstring(L, OPEN_FAILED);
        return 2;
    }
    *slot = doc;
    lua_pushvalue(L, -2);
    lua_setmetatable(L, -2);
    lua_pushnil(L);
    return 2;
}

int Open(lua_State *L)
{
    const char *name = luaL_checkstring(L, 1);
    const char *format = luaL_optstring(L, 2, "AUTO");
    VELMAUDIO *slot = push_empty_object(L);
    return answer_object(L, slot, VELMAUDIO_Open(name, format));
}

int New(lua_State *L)
{
    const char *text = luaL_optstring(L, 2, "AUTO[sr=8000,nc=1]");
    VELMAUDIO *slot = push_empty_object(L);
    _audio_format format;
    return answer_object(L, slot, velmlua::read_new_format(text, &format) ? VELMAUDIO_New(&format) : nullptr);
}

VELMAUDIO *check_object(lua_State *L)
{
    return static_cast<VELMAUDIO *>(luaL_checkudata(L, 1, TYPE_NAME));
}

int Save(lua_State *L)
{
    VELMAUDIO *slot = check_object(L);
    const char *name = luaL_optstring(L, 2, nullptr);
    const char *format = luaL_optstring(L, 3, "FROM_FORMAT");
    const int status = name ? VELMAUDIO_SaveAs(*slot, name, save_format(format)) : VELMAUDIO_Save(*slot);
    return L_Return_ReturnStatus(L, status, "Unable to save VELMAUDIO");
}

int Collect(lua_State *L)
{
    VELMAUDIO *slot = check_object(L);
    fputs("I have been collected!\n", stderr);
    if (*slot) {
        VELMAUDIO_Close(*slot);
        *slot = nullptr;
    }
    return 0;
}

int ToString(lua_State *L)
{
    VELMAUDIO *slot = check_object(L);
    lua_pushfstring(L, "VELMAUDIO object at %p", static_cast<void *>(*slot));
    return 1;
}

const luaL_Reg module_functions[] = {
    {"open", Open},
    {"new", New},
    {nullptr, nullptr},
};

const luaL_Reg object_methods[] = {
    {"save", Save},
    {"__gc", Collect},
    {"__tostring", ToString},
    {nullptr, nullptr},
};

} // namespace

int luaopen_libvelm(lua_State *L)
{
    if (!L) return 0;
    lua_pushcfunction(L, luaopen_libvelmbase);
    lua_call(L, 0, 0);
    L_OpenModule(L, "libvelm", module_functions);
    L_RegisterType(L, TYPE_NAME, object_methods);
    return 1;
}
