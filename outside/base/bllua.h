/*
 * Lua 5.1 support of the base services library: helpers that script
 * bindings use to register their modules and types and to answer with a
 * status, and the library's own Lua module.
 */
#ifndef BLLUA_H
#define BLLUA_H

#include "outside/base/blbase.h"

#ifdef __cplusplus
#include <lua5.1/lua.hpp>
extern "C" {
#else
#include <lua5.1/lauxlib.h>
#include <lua5.1/lua.h>
#endif

/* Creates (or completes) the metatable registered under type_name in the Lua
 * registry, makes it its own __index and adds the methods (null-terminated,
 * may be null).  The stack is left as it was.  Returns 1, or 0 for null
 * arguments. */
BL_API int L_RegisterType(lua_State *L, const char *type_name, const luaL_Reg *methods);

/* The usual way a call answers: true for a nonzero status, otherwise nil and
 * failure_text ("failed" when null).  Returns how many values it pushed. */
BL_API int L_Return_ReturnStatus(lua_State *L, int status, const char *failure_text);

/* Registers the module table name with the functions (luaL_register) and
 * leaves it on the stack.  Returns 1 (the count of values to return from a
 * module opener), or 0 for null arguments. */
BL_API int L_OpenModule(lua_State *L, const char *name, const luaL_Reg *functions);

/* Opens the module "libvelmbase" (require "libvelmbase"):
 *   version(name)        -> "name a.b.c.d", or nil and a message
 *   getsetting(key)      -> the setting's text ("key=[default]" allowed)
 *   setsetting(text)     -> status of "key=value" (true when it changed)
 *   log(level, message)  -> writes message to the log at level
 * Returns 1. */
BL_API int luaopen_libvelmbase(lua_State *L);

#ifdef __cplusplus
}
#endif

#endif /* BLLUA_H */
