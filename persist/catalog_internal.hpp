// The catalogue's process-wide state, shared by opening, closing and the
// event handler.
#ifndef VELM_CATALOG_INTERNAL_HPP
#define VELM_CATALOG_INTERNAL_HPP

#include <sqlite3.h>

#include "outside/base/blbase.h"

namespace velmdb {

enum Statement {
    LOOKUP_ID_TIME,
    LOOKUP_ID_COUNT,
    LOOKUP_ID_TIME_FORMAT,
    LOOKUP_ID_TIME_FORMAT_COUNT,
    SET_FORMAT,
    DELETE_BY_ID,
    INSERT,
    UPDATE_ALL,
    STATEMENT_COUNT
};

// All null while the catalogue is closed.  The lock serialises every use of
// the connection and its statements.
struct Catalog {
    sqlite3 *db = nullptr;
    sqlite3_stmt *statements[STATEMENT_COUNT] = {};
    BLMUTEX lock = nullptr;
};

Catalog &catalog();

// The notification handler registered while the catalogue is open.
int handle_event(const BLNotifyEvent *event, void *user);

// Runs a fixed statement; a failure is logged with SQLite's message.
bool execute(sqlite3 *db, const char *sql);

} // namespace velmdb

#endif
