// The catalogue seen from outside: rows written by opens, links and saves,
// the answers to the document events, and the migration of older catalogues.
#include "catalog_support.hpp"

#include <sys/stat.h>
#include <utime.h>

namespace {

using cattest::CatalogTest;
using cattest::Reader;

TEST_F(CatalogTest, OpensOnceAndClosesOnlyWhatIsOpen)
{
    EXPECT_EQ(VELMDB_CloseDatabase(), 0);
    EXPECT_EQ(VELMDB_OpenDatabase(nullptr), 0);
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    const std::string other = dir.file("other.db");
    EXPECT_EQ(VELMDB_OpenDatabase(other.c_str()), 1);
    EXPECT_GT(open_once(sound), 0);
    EXPECT_EQ(VELMDB_CloseDatabase(), 1);
    EXPECT_EQ(VELMDB_CloseDatabase(), 0);

    // The second open kept the first catalogue: the record went there.
    EXPECT_EQ(Reader(database).rows().size(), 1u);
    EXPECT_FALSE(std::filesystem::exists(other));
    EXPECT_EQ(Reader(database).first("PRAGMA journal_mode;"), "wal");
}

TEST_F(CatalogTest, OpeningAFileWritesItsRow)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    VELMAUDIO doc = VELMAUDIO_Open(sound.c_str(), "AUTO");
    ASSERT_NE(doc, nullptr);
    const int64_t id = VELMAUDIO_GetFileId(doc);
    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), 1u);
    const cattest::Row &row = rows[0];
    EXPECT_EQ(row.id, id);
    EXPECT_EQ(row.filename, cattest::canonical(sound));
    EXPECT_EQ(static_cast<uint64_t>(row.timestamp), VELMAUDIO_GetFileTime(doc));
    EXPECT_NE(row.timestamp, 0);
    EXPECT_DOUBLE_EQ(row.duration, static_cast<double>(FRAMES) / RATE);
    EXPECT_EQ(row.filesize, 0);
    EXPECT_EQ(row.formatstring, VELMAUDIO_GetFileFormatString(doc));
    EXPECT_EQ(row.samplerate, RATE);
    EXPECT_EQ(row.numchannels, 2);
    EXPECT_EQ(row.countaccess, 1);
    EXPECT_FALSE(row.lastaccess.empty());
    VELMAUDIO_Close(doc);
}

TEST_F(CatalogTest, ReopeningRecognisesTheFileAndCountsTheAccess)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    const int64_t first = open_once(sound);
    ASSERT_GT(first, 0);
    Reader reader(database);
    ASSERT_TRUE(reader.run("UPDATE libvelm_velmdb_catalog_v2 SET lastaccess = '2001-01-01 00:00:00';"));

    // A link to the unchanged file is recognised before it is loaded.
    VELMAUDIO link = VELMAUDIO_CreateLink(sound.c_str(), "AUTO");
    ASSERT_NE(link, nullptr);
    EXPECT_EQ(VELMAUDIO_GetFileId(link), first);
    ASSERT_EQ(VELMAUDIO_OpenLink(link), 1);
    EXPECT_EQ(VELMAUDIO_GetFileId(link), first);
    VELMAUDIO_Close(link);

    const auto rows = reader.rows();
    ASSERT_EQ(rows.size(), 1u);
    EXPECT_EQ(rows[0].countaccess, 2);
    EXPECT_NE(rows[0].lastaccess, "2001-01-01 00:00:00");
}

TEST_F(CatalogTest, AChangedFileIsNotRecognised)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    const int64_t first = open_once(sound);
    ASSERT_GT(first, 0);
    struct utimbuf times = {1000000000, 1000000000};
    ASSERT_EQ(utime(sound.c_str(), &times), 0);

    VELMAUDIO fresh = VELMAUDIO_CreateUnresolvedLink();
    const int64_t untouched = VELMAUDIO_GetFileId(fresh);
    ASSERT_EQ(VELMAUDIO_Link(fresh, sound.c_str(), "AUTO"), 1);
    EXPECT_EQ(VELMAUDIO_GetFileId(fresh), untouched);
    const char *format = nullptr;
    BLNOTIFY_SendEvent(nullptr, nullptr, 0, 0x20002, fresh, &format);
    EXPECT_EQ(format, nullptr);

    // Loading it records the new time under the same row.
    ASSERT_EQ(VELMAUDIO_OpenLink(fresh), 1);
    EXPECT_EQ(VELMAUDIO_GetFileId(fresh), first);
    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), 1u);
    EXPECT_EQ(static_cast<uint64_t>(rows[0].timestamp), VELMAUDIO_GetFileTime(fresh));
    VELMAUDIO_Close(fresh);
}

TEST_F(CatalogTest, HandsBackTheCachedFormatText)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    ASSERT_GT(open_once(sound), 0);
    VELMAUDIO link = VELMAUDIO_CreateLink(sound.c_str(), "AUTO");
    const char *format = nullptr;
    EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, 0x20002, link, &format), 1);
    ASSERT_NE(format, nullptr);
    EXPECT_EQ(std::string(format), Reader(database).rows().at(0).formatstring);
    EXPECT_NE(std::string(format).find("WAVE"), std::string::npos);
    VELMAUDIO_Close(link);
}

TEST_F(CatalogTest, SavingRecordsTheNewFile)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    _audio_format format = AUDIO_InitFormat(16000, 1, 16);
    VELMAUDIO doc = VELMAUDIO_New(&format);
    ASSERT_NE(doc, nullptr);
    ASSERT_GT(AUDIOSIGNAL_AppendSilence(VELMAUDIO_GetAudioSignal(doc), 8000), 0);
    const std::string saved = dir.file("saved.flac");
    ASSERT_EQ(VELMAUDIO_SaveAs(doc, saved.c_str(), "AUTO"), 1);
    const int64_t id = VELMAUDIO_GetFileId(doc);
    ASSERT_EQ(VELMAUDIO_Save(doc), 1);
    EXPECT_EQ(VELMAUDIO_GetFileId(doc), id);
    VELMAUDIO_Close(doc);

    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), 1u);
    EXPECT_EQ(rows[0].id, id);
    EXPECT_EQ(rows[0].filename, cattest::canonical(saved));
    EXPECT_EQ(rows[0].samplerate, 16000);
    EXPECT_EQ(rows[0].numchannels, 1);
    EXPECT_DOUBLE_EQ(rows[0].duration, 0.5);
    EXPECT_EQ(rows[0].countaccess, 2);
    EXPECT_EQ(open_once(saved), id);
}

TEST_F(CatalogTest, RefusesEventsWithoutDocumentOrSlot)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    VELMAUDIO doc = VELMAUDIO_Open(sound.c_str(), "AUTO");
    int64_t id = -7;
    int not_a_document = 0;
    for (uint32_t code : {0x20001u, 0x20002u, 0x20005u, 0x20006u}) {
        EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, code, nullptr, &id), 0);
        EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, code, doc, nullptr), 0);
        EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, code, &not_a_document, &id), 0);
    }
    EXPECT_EQ(id, -7);
    EXPECT_EQ(BLNOTIFY_SendEvent(nullptr, nullptr, 0, 0x20003, nullptr, nullptr), 1);
    VELMAUDIO_Close(doc);
    EXPECT_EQ(Reader(database).rows().size(), 1u);
}

TEST_F(CatalogTest, OddFileNamesAreStoredAndFoundAgain)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    const std::vector<std::string> names = {
        "it's \"quoted\".wav", "line\nbreak.wav", "bytes \xff\xfe\x80.wav", "x'); DROP TABLE libvelm_velmdb_catalog_v2;--.wav",
        "\xc3\xa9t\xc3\xa9 \xe2\x99\xab.wav"};
    const auto samples = velmtest::sine(8000, 1, 800);
    std::vector<int64_t> ids;
    for (const std::string &name : names) {
        const std::string path = dir.file(name);
        ASSERT_TRUE(velmtest::write_audio(path, samples, 8000, 1)) << name;
        ids.push_back(open_once(path));
        EXPECT_GT(ids.back(), 0) << name;
    }
    for (size_t i = 0; i < names.size(); ++i) EXPECT_EQ(open_once(dir.file(names[i])), ids[i]) << names[i];

    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), names.size());
    for (size_t i = 0; i < names.size(); ++i) {
        EXPECT_EQ(rows[i].filename, cattest::canonical(dir.file(names[i])));
        EXPECT_EQ(rows[i].countaccess, 2);
    }
}

TEST_F(CatalogTest, LongNamesThatShareABeginningStayApart)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    std::string folder = dir.file(std::string(200, 'a'));
    folder += "/" + std::string(200, 'b');
    folder += "/" + std::string(200, 'c');
    std::filesystem::create_directories(folder);
    const std::string one = folder + "/one.wav", two = folder + "/two.wav";
    ASSERT_GT(one.size(), 511u);
    const auto samples = velmtest::sine(8000, 1, 800);
    ASSERT_TRUE(velmtest::write_audio(one, samples, 8000, 1));
    ASSERT_TRUE(velmtest::write_audio(two, samples, 8000, 1));
    const int64_t first = open_once(one), second = open_once(two);
    EXPECT_GT(first, 0);
    EXPECT_GT(second, 0);
    EXPECT_NE(first, second);
    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), 2u);
    EXPECT_EQ(rows[1].filename, cattest::canonical(two));
}

// An earlier release's catalogue: the first catalogue table and a regions
// table with its index beside the current table.
void make_old_catalogue(const std::string &path)
{
    Reader old(path);
    ASSERT_TRUE(old.run("CREATE TABLE libvelm_velmdb_catalog (id INTEGER PRIMARY KEY, filename VARCHAR, data BLOB);"));
    ASSERT_TRUE(old.run("CREATE TABLE libvelm_velmdb_regions (id INTEGER PRIMARY KEY, text_data VARCHAR);"));
    ASSERT_TRUE(old.run("CREATE INDEX libvelm_velmdb_regions_ix_text_data ON libvelm_velmdb_regions (text_data);"));
    ASSERT_TRUE(old.run(
        "CREATE TABLE libvelm_velmdb_catalog_v2 (id INTEGER PRIMARY KEY AUTOINCREMENT NOT NULL, filename VARCHAR NOT "
        "NULL UNIQUE, timestamp INTEGER NOT NULL, duration DOUBLE NOT NULL, filesize INTEGER NOT NULL, formatstring "
        "VARCHAR NOT NULL, samplerate INTEGER NOT NULL, numchannels INTEGER NOT NULL, lastaccess TIMESTAMP NOT NULL "
        "DEFAULT CURRENT_TIMESTAMP, countaccess INTEGER NOT NULL DEFAULT 1);"));
    ASSERT_TRUE(old.run("INSERT INTO libvelm_velmdb_catalog_v2 (filename, timestamp, duration, filesize, formatstring, "
                        "samplerate, numchannels, countaccess) VALUES ('/kept.wav', 5, 1.5, 0, 'WAVE', 44100, 2, 9);"));
    ASSERT_TRUE(old.run("WITH RECURSIVE n(i) AS (SELECT 1 UNION ALL SELECT i + 1 FROM n WHERE i < 2000) "
                        "INSERT INTO libvelm_velmdb_catalog (filename, data) SELECT 'old' || i, zeroblob(500) FROM n;"));
    ASSERT_TRUE(old.run("INSERT INTO libvelm_velmdb_regions (text_data) SELECT filename FROM libvelm_velmdb_catalog;"));
}

TEST_F(CatalogTest, MigratesTheEarlierReleasesCatalogue)
{
    make_old_catalogue(database);
    const auto size_before = std::filesystem::file_size(database);
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    {
        Reader reader(database);
        EXPECT_EQ(reader.first("SELECT group_concat(name) FROM sqlite_master WHERE name LIKE 'libvelm_velmdb_%';"),
                  "libvelm_velmdb_catalog_v2,libvelm_velmdb_catalog_v2_ix_lastaccess");
        const auto rows = reader.rows();
        ASSERT_EQ(rows.size(), 1u);
        EXPECT_EQ(rows[0].filename, "/kept.wav");
        EXPECT_EQ(rows[0].countaccess, 9);
        EXPECT_EQ(reader.first("PRAGMA freelist_count;"), "0");
    }
    // Vacuumed: once the last connection is gone, the file has shrunk.
    EXPECT_EQ(VELMDB_CloseDatabase(), 1);
    EXPECT_LT(std::filesystem::file_size(database), size_before / 10);
}

} // namespace
