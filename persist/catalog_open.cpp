// Opening and closing the catalogue: the schema, the migration from the
// earlier release's tables and the prepared statements.
#include "persist/catalog_internal.hpp"
#include "persist/velmdb.h"

#include <chrono>
#include <cstdio>
#include <string>

namespace velmdb {

namespace {

// Two processes sharing one catalogue wait this long for each other's writes.
constexpr int BUSY_TIMEOUT_MS = 10000;

const char *const CREATE_TABLE =
    "CREATE TABLE IF NOT EXISTS 'libvelm_velmdb_catalog_v2' ('id' INTEGER PRIMARY KEY AUTOINCREMENT NOT NULL, "
    "'filename' VARCHAR NOT NULL UNIQUE, 'timestamp' INTEGER NOT NULL, 'duration' DOUBLE NOT NULL, "
    "'filesize' INTEGER NOT NULL, 'formatstring' VARCHAR NOT NULL, 'samplerate' INTEGER NOT NULL, "
    "'numchannels' INTEGER NOT NULL, 'lastaccess' TIMESTAMP NOT NULL DEFAULT CURRENT_TIMESTAMP, "
    "'countaccess' INTEGER NOT NULL DEFAULT 1);";

// The schema and the removal of the earlier release's tables, in one transaction.
const char *const SCHEMA_STEPS[] = {
    "BEGIN IMMEDIATE;",
    CREATE_TABLE,
    "CREATE INDEX IF NOT EXISTS libvelm_velmdb_catalog_v2_ix_lastaccess ON libvelm_velmdb_catalog_v2 (lastaccess DESC);",
    "DROP TABLE IF EXISTS libvelm_velmdb_catalog;",
    "DROP INDEX IF EXISTS libvelm_velmdb_regions_ix_text_data;",
    "DROP TABLE IF EXISTS libvelm_velmdb_regions;",
    "COMMIT;",
};

const char *const STATEMENT_TEXTS[STATEMENT_COUNT] = {
    "SELECT id, timestamp FROM libvelm_velmdb_catalog_v2 WHERE filename = ?1;",
    "SELECT id, countaccess FROM libvelm_velmdb_catalog_v2 WHERE filename = ?1;",
    "SELECT id, timestamp, formatstring FROM libvelm_velmdb_catalog_v2 WHERE filename = ?1;",
    "SELECT id, timestamp, formatstring, countaccess FROM libvelm_velmdb_catalog_v2 WHERE filename = ?1;",
    "UPDATE libvelm_velmdb_catalog_v2 SET formatstring = ?1 WHERE id = ?2;",
    "DELETE FROM libvelm_velmdb_catalog_v2 WHERE id = ?1;",
    "INSERT INTO libvelm_velmdb_catalog_v2 (filename, timestamp, duration, filesize, formatstring, samplerate, "
    "numchannels) VALUES (?1,?2,?3,?4,?5,?6,?7);",
    "UPDATE libvelm_velmdb_catalog_v2 SET timestamp = ?1, duration = ?2, filesize = ?3, formatstring = ?4, "
    "samplerate = ?5, numchannels = ?6, lastaccess = CURRENT_TIMESTAMP, countaccess = ?7 WHERE id = ?8;",
};

// Closing finalises the writers first, then the look-ups.
const Statement FINALIZE_ORDER[STATEMENT_COUNT] = {
    INSERT, UPDATE_ALL, DELETE_BY_ID, SET_FORMAT,
    LOOKUP_ID_TIME, LOOKUP_ID_COUNT, LOOKUP_ID_TIME_FORMAT, LOOKUP_ID_TIME_FORMAT_COUNT,
};

Catalog the_catalog;

int first_cell(void *out, int columns, char **values, char **)
{
    auto *text = static_cast<std::string *>(out);
    if (text->empty() && columns > 0 && values[0]) *text = values[0];
    return 0;
}

// Reads the whole file before anything is written to it, so a damaged or
// foreign file is refused while still untouched.
bool is_sound_database(sqlite3 *db)
{
    const char *sql = "PRAGMA quick_check;";
    std::string answer;
    char *error = nullptr;
    if (sqlite3_exec(db, sql, first_cell, &answer, &error) != SQLITE_OK) {
        BLDEBUG_Error(-1, "(VELMDB)_QueryDB: Error (%s) executing query (%s)", error ? error : sqlite3_errmsg(db), sql);
        sqlite3_free(error);
        return false;
    }
    if (answer != "ok") {
        BLDEBUG_Error(-1, "(VELMDB)_QueryDB: Error (%s) executing query (%s)", answer.c_str(), sql);
        return false;
    }
    return true;
}

// Readers and the writer no longer block each other; with the write-ahead
// log, a crash may lose the last records but never damages the file.  The
// switch needs the file to itself.  Another connection's reader makes SQLite
// wait in its busy handler, a writer makes it give up at once; either way a
// second process opening a new catalogue at the same moment retries until
// the time it would wait for a write has passed.
bool use_write_ahead_log(sqlite3 *db)
{
    constexpr int RETRY_MS = 5;
    const char *sql = "PRAGMA journal_mode=WAL;";
    const auto deadline = std::chrono::steady_clock::now() + std::chrono::milliseconds(BUSY_TIMEOUT_MS);
    for (;;) {
        const int rc = sqlite3_exec(db, sql, nullptr, nullptr, nullptr);
        if (rc == SQLITE_OK) return true;
        if ((rc != SQLITE_BUSY && rc != SQLITE_LOCKED) || std::chrono::steady_clock::now() >= deadline) {
            BLDEBUG_Error(-1, "(VELMDB)_QueryDB: Error (%s) executing query (%s)", sqlite3_errmsg(db), sql);
            return false;
        }
        sqlite3_sleep(RETRY_MS);
    }
}

bool create_schema(sqlite3 *db)
{
    if (!use_write_ahead_log(db) || !execute(db, "PRAGMA synchronous=NORMAL;")) return false;
    for (const char *step : SCHEMA_STEPS) {
        if (!execute(db, step)) {
            sqlite3_exec(db, "ROLLBACK;", nullptr, nullptr, nullptr);
            return false;
        }
    }
    return execute(db, "VACUUM;");
}

bool prepare_statements(Catalog &c)
{
    for (int i = 0; i < STATEMENT_COUNT; ++i) {
        if (sqlite3_prepare_v2(c.db, STATEMENT_TEXTS[i], -1, &c.statements[i], nullptr) != SQLITE_OK) {
            fprintf(stderr, "(VELMDB)_PrepareStmt error: %s\n", sqlite3_errmsg(c.db));
            return false;
        }
    }
    return true;
}

void finalize_statements(Catalog &c)
{
    for (Statement s : FINALIZE_ORDER) {
        if (c.statements[s] && sqlite3_finalize(c.statements[s]) != SQLITE_OK)
            fprintf(stderr, "(VELMDB)_FinalizeStmt error: %s\n", sqlite3_errmsg(c.db));
        c.statements[s] = nullptr;
    }
}

bool close_connection(Catalog &c)
{
    const bool closed = sqlite3_close(c.db) == SQLITE_OK;
    if (!closed) BLDEBUG_Error(-1, "(VELMDB)_CloseDB: Can't close database");
    c.db = nullptr;
    return closed;
}

bool open_connection(Catalog &c, const char *path)
{
    const int rc = sqlite3_open_v2(path, &c.db, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE, nullptr);
    // SQLite falls back to reading a file it may not write; a catalogue must write.
    if (rc != SQLITE_OK || sqlite3_db_readonly(c.db, "main") == 1) {
        BLDEBUG_Error(-1, "(VELMDB)_OpenDB: Can't open database (%s)", path);
        close_connection(c);
        return false;
    }
    sqlite3_busy_timeout(c.db, BUSY_TIMEOUT_MS);
    return true;
}

} // namespace

Catalog &catalog()
{
    return the_catalog;
}

bool execute(sqlite3 *db, const char *sql)
{
    char *error = nullptr;
    if (sqlite3_exec(db, sql, nullptr, nullptr, &error) == SQLITE_OK) return true;
    BLDEBUG_Error(-1, "(VELMDB)_QueryDB: Error (%s) executing query (%s)", error ? error : sqlite3_errmsg(db), sql);
    sqlite3_free(error);
    return false;
}

} // namespace velmdb

using velmdb::Catalog;

int VELMDB_OpenDatabase(const char *path)
{
    Catalog &c = velmdb::catalog();
    if (c.db) return 1;
    if (!path) return 0;
    if (!velmdb::open_connection(c, path)) return 0;
    if (velmdb::is_sound_database(c.db) && velmdb::create_schema(c.db) && velmdb::prepare_statements(c)) {
        c.lock = MutexInit();
        if (c.lock && BLNOTIFY_AddDefaultHandler(velmdb::handle_event, &c)) return 1;
        if (c.lock) MutexDestroy(c.lock);
        c.lock = nullptr;
    }
    velmdb::finalize_statements(c);
    velmdb::close_connection(c);
    return 0;
}

int VELMDB_CloseDatabase(void)
{
    Catalog &c = velmdb::catalog();
    if (!c.db) return 0;
    // The handler goes first so that no event meets a half-closed catalogue.
    BLNOTIFY_DelDefaultHandler(velmdb::handle_event, &c);
    MutexLock(c.lock);
    velmdb::finalize_statements(c);
    const bool closed = velmdb::close_connection(c);
    MutexUnlock(c.lock);
    MutexDestroy(c.lock);
    c.lock = nullptr;
    return closed ? 1 : 0;
}
