// Shared by the catalogue tests: a temporary catalogue, audio files to
// record, a second connection that reads the rows back, and a log counter.
#ifndef VELM_TESTS_CATALOG_SUPPORT_HPP
#define VELM_TESTS_CATALOG_SUPPORT_HPP

#include "core/velmaudio.h"
#include "core/velmqueries.h"
#include "persist/velmdb.h"
#include "testaudio.hpp"

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <fstream>
#include <iterator>
#include <string>
#include <vector>

namespace cattest {

// One catalogue row as the shell would read it.
struct Row {
    int64_t id = -1;
    std::string filename;
    int64_t timestamp = 0;
    double duration = 0;
    int64_t filesize = -1;
    std::string formatstring;
    int samplerate = 0;
    int numchannels = 0;
    std::string lastaccess;
    int countaccess = 0;
};

// A connection of its own, as another program reading the catalogue.
class Reader {
public:
    explicit Reader(const std::string &path) { sqlite3_open_v2(path.c_str(), &db_, SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE, nullptr); }
    ~Reader() { sqlite3_close(db_); }
    Reader(const Reader &) = delete;
    Reader &operator=(const Reader &) = delete;

    std::vector<Row> rows() const
    {
        std::vector<Row> out;
        sqlite3_stmt *st = nullptr;
        sqlite3_prepare_v2(db_,
                           "SELECT id, filename, timestamp, duration, filesize, formatstring, samplerate, "
                           "numchannels, lastaccess, countaccess FROM libvelm_velmdb_catalog_v2 ORDER BY id;",
                           -1, &st, nullptr);
        while (st && sqlite3_step(st) == SQLITE_ROW) {
            Row r;
            r.id = sqlite3_column_int64(st, 0);
            r.filename = text(st, 1);
            r.timestamp = sqlite3_column_int64(st, 2);
            r.duration = sqlite3_column_double(st, 3);
            r.filesize = sqlite3_column_int64(st, 4);
            r.formatstring = text(st, 5);
            r.samplerate = sqlite3_column_int(st, 6);
            r.numchannels = sqlite3_column_int(st, 7);
            r.lastaccess = text(st, 8);
            r.countaccess = sqlite3_column_int(st, 9);
            out.push_back(r);
        }
        sqlite3_finalize(st);
        return out;
    }

    // The first column of the first row of a query, as text.
    std::string first(const std::string &sql) const
    {
        sqlite3_stmt *st = nullptr;
        std::string out;
        if (sqlite3_prepare_v2(db_, sql.c_str(), -1, &st, nullptr) == SQLITE_OK && sqlite3_step(st) == SQLITE_ROW)
            out = text(st, 0);
        sqlite3_finalize(st);
        return out;
    }

    bool run(const std::string &sql) const { return sqlite3_exec(db_, sql.c_str(), nullptr, nullptr, nullptr) == SQLITE_OK; }

private:
    static std::string text(sqlite3_stmt *st, int column)
    {
        const void *bytes = sqlite3_column_blob(st, column);
        return bytes ? std::string(static_cast<const char *>(bytes), static_cast<size_t>(sqlite3_column_bytes(st, column)))
                     : std::string();
    }
    sqlite3 *db_ = nullptr;
};

inline std::string canonical(const std::string &path)
{
    char buffer[4096];
    return BLIO_ExtractCanonicalFileName(path.c_str(), buffer, sizeof buffer) ? buffer : "";
}

inline std::string file_bytes(const std::string &path)
{
    std::ifstream in(path, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(in), std::istreambuf_iterator<char>());
}

// Counts the errors that reach the log while it lives.
class ErrorCounter {
public:
    ErrorCounter() { BLDEBUG_SetSink(sink, this); }
    ~ErrorCounter() { BLDEBUG_SetSink(nullptr, nullptr); }
    ErrorCounter(const ErrorCounter &) = delete;
    ErrorCounter &operator=(const ErrorCounter &) = delete;
    std::vector<std::string> messages;

private:
    static void sink(int kind, int, const char *message, void *user)
    {
        if (kind == BLDEBUG_KIND_ERROR) static_cast<ErrorCounter *>(user)->messages.emplace_back(message);
    }
};

// A temporary folder with a catalogue path and a short stereo recording.
class CatalogTest : public ::testing::Test {
protected:
    void SetUp() override
    {
        ASSERT_TRUE(velmtest::write_audio(sound, velmtest::sine(RATE, 2, FRAMES), RATE, 2));
    }
    void TearDown() override { VELMDB_CloseDatabase(); }

    // Opens a file as the shell does and closes it again; the catalogue id.
    static int64_t open_once(const std::string &path)
    {
        VELMAUDIO doc = VELMAUDIO_Open(path.c_str(), "AUTO");
        if (!doc) return -2;
        const int64_t id = VELMAUDIO_GetFileId(doc);
        VELMAUDIO_Close(doc);
        return id;
    }

    static constexpr int RATE = 22050;
    static constexpr int FRAMES = 2205;
    velmtest::TempDir dir;
    std::string database = dir.file("catalog.db");
    std::string sound = dir.file("tone.wav");
};

} // namespace cattest

#endif
