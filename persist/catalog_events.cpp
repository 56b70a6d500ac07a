// The catalogue's answers to document events: recognising a file seen
// before, handing back its cached format text, and recording opens and saves.
#include "persist/catalog_internal.hpp"

#include <cstdio>
#include <cstring>
#include <limits.h>
#include <string>

#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "core/velmtimeconv.h"

namespace velmdb {

namespace {

constexpr uint32_t EVENT_LINKED = 0x20001;
constexpr uint32_t EVENT_FORMAT_REQUEST = 0x20002;
constexpr uint32_t EVENT_OPENED = 0x20005;
constexpr uint32_t EVENT_SAVED = 0x20006;

class Locked {
public:
    explicit Locked(BLMUTEX lock) : lock_(lock) { MutexLock(lock_); }
    ~Locked() { MutexUnlock(lock_); }
    Locked(const Locked &) = delete;
    Locked &operator=(const Locked &) = delete;

private:
    BLMUTEX lock_;
};

// Resets a statement when the answer has been read, so that no read
// transaction stays open between events.
class Query {
public:
    explicit Query(sqlite3_stmt *statement) : statement_(statement) {}
    ~Query() { sqlite3_reset(statement_); }
    Query(const Query &) = delete;
    Query &operator=(const Query &) = delete;
    sqlite3_stmt *operator*() const { return statement_; }

    // Clears what the previous use left and binds the file name to ?1.
    bool bind_name(const std::string &name, const char *failure)
    {
        if (sqlite3_reset(statement_) != SQLITE_OK)
            fprintf(stderr, "(VELMDB)_ResetStmt error: %s\n", sqlite3_errmsg(sqlite3_db_handle(statement_)));
        if (sqlite3_bind_text(statement_, 1, name.data(), static_cast<int>(name.size()), SQLITE_TRANSIENT) == SQLITE_OK)
            return true;
        BLDEBUG_Error(-1, failure, sqlite3_errmsg(sqlite3_db_handle(statement_)));
        return false;
    }

private:
    sqlite3_stmt *statement_;
};

// The name a file is catalogued under; empty when it has none or when it
// does not fit a path (a cut name could stand for another file).
std::string canonical_name(VELMAUDIO doc)
{
    char buffer[PATH_MAX];
    if (!BLIO_ExtractCanonicalFileName(VELMAUDIO_GetFileName(doc), buffer, sizeof buffer)) return {};
    const size_t length = strlen(buffer);
    if (length + 1 >= sizeof buffer) return {};
    return std::string(buffer, length);
}

bool time_matches(sqlite3_stmt *row, int column, VELMAUDIO doc)
{
    return static_cast<uint64_t>(sqlite3_column_int64(row, column)) == VELMAUDIO_GetFileTime(doc);
}

int find_id(Catalog &c, VELMAUDIO doc, const std::string &name, int64_t *slot)
{
    Query query(c.statements[LOOKUP_ID_TIME]);
    if (query.bind_name(name, "(VELMDB)_Query_idts error: %s\n") && sqlite3_step(*query) == SQLITE_ROW &&
        time_matches(*query, 1, doc))
        *slot = sqlite3_column_int64(*query, 0);
    return 1;
}

int find_format(Catalog &c, VELMAUDIO doc, const std::string &name, const char **slot)
{
    // The answer outlives the statement's row: each thread keeps its last one.
    thread_local std::string format;
    Query query(c.statements[LOOKUP_ID_TIME_FORMAT]);
    if (query.bind_name(name, "(VELMDB)_Query_idtsfs error: %s\n") && sqlite3_step(*query) == SQLITE_ROW &&
        time_matches(*query, 1, doc)) {
        const unsigned char *text = sqlite3_column_text(*query, 2);
        format.assign(text ? reinterpret_cast<const char *>(text) : "");
        *slot = format.c_str();
    }
    return 1;
}

// What a record writes besides the name, id and count.
struct FileFacts {
    uint64_t time;
    double duration;
    std::string format;
    int sample_rate;
    int channels;
};

FileFacts file_facts(VELMAUDIO doc)
{
    _audio_format format;
    VELMAUDIO_GetSignalFormat(&format, doc);
    const char *text = VELMAUDIO_GetFileFormatString(doc);
    return {VELMAUDIO_GetFileTime(doc), VELMAUDIO_Duration(doc), text ? text : "", format.sampleRate,
            format.numChannels};
}

// Binds ?first .. ?first+5 to time, duration, size, format, rate and channels.
bool bind_facts(sqlite3_stmt *statement, int first, const FileFacts &facts)
{
    return sqlite3_bind_int64(statement, first, static_cast<sqlite3_int64>(facts.time)) == SQLITE_OK &&
           sqlite3_bind_double(statement, first + 1, facts.duration) == SQLITE_OK &&
           sqlite3_bind_int64(statement, first + 2, 0) == SQLITE_OK &&
           sqlite3_bind_text(statement, first + 3, facts.format.data(), static_cast<int>(facts.format.size()),
                             SQLITE_TRANSIENT) == SQLITE_OK &&
           sqlite3_bind_int(statement, first + 4, facts.sample_rate) == SQLITE_OK &&
           sqlite3_bind_int(statement, first + 5, facts.channels) == SQLITE_OK;
}

bool update_row(Catalog &c, int64_t id, int64_t count, const FileFacts &facts)
{
    Query update(c.statements[UPDATE_ALL]);
    if (!(sqlite3_bind_int64(*update, 8, id) == SQLITE_OK && bind_facts(*update, 1, facts) &&
          sqlite3_bind_int64(*update, 7, count + 1) == SQLITE_OK)) {
        fprintf(stderr, "(VELMDB)_Query_update error: %s\n", sqlite3_errmsg(c.db));
        return false;
    }
    return sqlite3_step(*update) == SQLITE_DONE;
}

bool insert_row(Catalog &c, const std::string &name, const FileFacts &facts, int64_t *id)
{
    Query insert(c.statements[INSERT]);
    if (!(sqlite3_bind_text(*insert, 1, name.data(), static_cast<int>(name.size()), SQLITE_TRANSIENT) == SQLITE_OK &&
          bind_facts(*insert, 2, facts))) {
        fprintf(stderr, "(VELMDB)_Query_insert error: %s\n", sqlite3_errmsg(c.db));
        return false;
    }
    if (sqlite3_step(*insert) != SQLITE_DONE) return false;
    *id = sqlite3_last_insert_rowid(c.db);
    return true;
}

// Updates the file's row or adds one; look-up and write form one transaction
// so that another process cannot add the same file in between.
int record(Catalog &c, VELMAUDIO doc, const std::string &name, int64_t *slot)
{
    const FileFacts facts = file_facts(doc);
    if (!execute(c.db, "BEGIN IMMEDIATE;")) return 0;
    bool found = false;
    int64_t id = -1, count = 0;
    {
        Query lookup(c.statements[LOOKUP_ID_COUNT]);
        if (lookup.bind_name(name, "(VELMDB)_Query_idct error: %s\n") && sqlite3_step(*lookup) == SQLITE_ROW) {
            found = true;
            id = sqlite3_column_int64(*lookup, 0);
            count = sqlite3_column_int64(*lookup, 1);
        }
    }
    const bool written = found ? update_row(c, id, count, facts) : insert_row(c, name, facts, &id);
    if (!written || !execute(c.db, "COMMIT;")) {
        sqlite3_exec(c.db, "ROLLBACK;", nullptr, nullptr, nullptr);
        if (found) *slot = id;
        return 0;
    }
    *slot = id;
    return 1;
}

} // namespace

int handle_event(const BLNotifyEvent *event, void *user)
{
    const uint32_t code = event->event;
    if (code != EVENT_LINKED && code != EVENT_FORMAT_REQUEST && code != EVENT_OPENED && code != EVENT_SAVED)
        return 1;
    Catalog &c = *static_cast<Catalog *>(user);
    Locked locked(c.lock);
    auto doc = static_cast<VELMAUDIO>(event->data1);
    // Only live documents are read: a stale handle from a sender is refused.
    if (!doc || !event->data2 || !IsRegisteredObject(doc)) return 0;
    const std::string name = canonical_name(doc);
    if (name.empty()) return code == EVENT_LINKED || code == EVENT_FORMAT_REQUEST ? 1 : 0;
    switch (code) {
    case EVENT_LINKED:
        return find_id(c, doc, name, static_cast<int64_t *>(event->data2));
    case EVENT_FORMAT_REQUEST:
        return find_format(c, doc, name, static_cast<const char **>(event->data2));
    default:
        return record(c, doc, name, static_cast<int64_t *>(event->data2));
    }
}

} // namespace velmdb
