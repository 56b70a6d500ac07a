// Files that cannot serve as a catalogue are refused, reported once and left
// exactly as they were; the library works on without a catalogue.
#include "catalog_support.hpp"

#include <sys/stat.h>
#include <unistd.h>

namespace {

using cattest::CatalogTest;
using cattest::ErrorCounter;
using cattest::Reader;

class BadCatalogTest : public CatalogTest {
protected:
    // Opening must fail with one logged message, keep the file's bytes and
    // leave the library without a catalogue.
    void expect_refused(const std::string &path)
    {
        const bool existed = std::filesystem::exists(path);
        const bool regular = std::filesystem::is_regular_file(path);
        const std::string before = regular ? cattest::file_bytes(path) : "";
        {
            ErrorCounter errors;
            EXPECT_EQ(VELMDB_OpenDatabase(path.c_str()), 0);
            EXPECT_EQ(errors.messages.size(), 1u);
        }
        EXPECT_EQ(std::filesystem::exists(path), existed);
        if (regular) {
            EXPECT_EQ(cattest::file_bytes(path), before);
        }
        EXPECT_FALSE(std::filesystem::exists(path + "-wal"));
        EXPECT_FALSE(std::filesystem::exists(path + "-journal"));
        EXPECT_EQ(VELMDB_CloseDatabase(), 0);
        VELMAUDIO doc = VELMAUDIO_Open(sound.c_str(), "AUTO");
        EXPECT_NE(doc, nullptr);
        VELMAUDIO_Close(doc);
    }
};

TEST_F(BadCatalogTest, ATextFileIsNotACatalogue)
{
    const std::string notes = dir.file("notes.txt");
    std::ofstream(notes) << "These are my notes, not a database.\n" << std::string(5000, 'x');
    expect_refused(notes);
}

TEST_F(BadCatalogTest, ADamagedCatalogueIsLeftAlone)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    for (int i = 0; i < 40; ++i) {
        const std::string path = dir.file("tone" + std::to_string(i) + ".wav");
        std::filesystem::copy_file(sound, path);
        ASSERT_GT(open_once(path), 0);
    }
    ASSERT_EQ(VELMDB_CloseDatabase(), 1);
    ASSERT_TRUE(Reader(database).run("PRAGMA journal_mode=DELETE;"));

    // Scribble over the middle of the second page, where the rows live.
    std::string bytes = cattest::file_bytes(database);
    ASSERT_GT(bytes.size(), 3u * 4096);
    for (size_t i = 4096 + 8; i < 4096 + 200; ++i) bytes[i] = static_cast<char>(0xA5);
    std::ofstream(database, std::ios::binary | std::ios::trunc) << bytes;
    expect_refused(database);
}

// The switch to the write-ahead log needs the file to itself: while another
// program keeps reading the catalogue, the open gives up after the wait a
// write would get, however many times it retried in between.
TEST_F(BadCatalogTest, ACatalogueAnotherProgramKeepsReadingIsLeftAlone)
{
    Reader other(database);
    ASSERT_TRUE(other.run("CREATE TABLE libvelm_velmdb_catalog (id INTEGER);"));
    ASSERT_TRUE(other.run("BEGIN;"));
    ASSERT_EQ(other.first("SELECT count(*) FROM libvelm_velmdb_catalog;"), "0");
    expect_refused(database);
    EXPECT_TRUE(other.run("COMMIT;"));
}

TEST_F(BadCatalogTest, AMissingFolderIsNotCreated)
{
    const std::string missing = dir.file("no/such/folder/catalog.db");
    expect_refused(missing);
    EXPECT_FALSE(std::filesystem::exists(dir.file("no")));
}

TEST_F(BadCatalogTest, AFolderIsNotACatalogue)
{
    expect_refused(dir.file(""));
}

TEST_F(BadCatalogTest, AReadOnlyCatalogueIsLeftAlone)
{
    ASSERT_EQ(VELMDB_OpenDatabase(database.c_str()), 1);
    ASSERT_GT(open_once(sound), 0);
    ASSERT_EQ(VELMDB_CloseDatabase(), 1);
    ASSERT_EQ(chmod(database.c_str(), 0444), 0);
    if (geteuid() == 0) GTEST_SKIP() << "the superuser writes read-only files";
    expect_refused(database);
}

} // namespace
