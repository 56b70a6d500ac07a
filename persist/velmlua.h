/*
 * The Lua 5.1 module "libvelm" (require "libvelm"):
 *   libvelm.open(name [, format = "AUTO"])   -> document, nil | nil, message
 *   libvelm:new([format = "AUTO[sr=8000,nc=1]"]) -> document, nil | nil, message
 *     (the format is the second argument: call it with a colon)
 *   document:save([name [, format]])          -> true | nil, message
 *   tostring(document)                        -> "VELMAUDIO object at 0x..."
 * A document object owns its document, which is closed when Lua collects it.
 */
#ifndef VELMLUA_H
#define VELMLUA_H

#include "core/velm_api.h"

#include <lua5.1/lua.h>

VELM_EXTERN_C_BEGIN

/* Loads the base library's module first, then leaves the "libvelm" table on
 * the stack.  Returns 1. */
VELM_API int luaopen_libvelm(lua_State *L);

VELM_EXTERN_C_END

#endif /* VELMLUA_H */
