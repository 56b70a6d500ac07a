// Two processes sharing one catalogue record the same files at once; no
// record is lost and every file keeps one row.
#include "catalog_support.hpp"

#include <sys/wait.h>
#include <unistd.h>

namespace {

using cattest::CatalogTest;
using cattest::Reader;

constexpr int FILES = 6;
constexpr int ROUNDS = 5;

// The child's whole life: its own catalogue connection, then every file
// opened ROUNDS times.  The exit status says whether each open was recorded.
[[noreturn]] void record_in_child(const std::string &database, const std::vector<std::string> &files)
{
    int failures = VELMDB_OpenDatabase(database.c_str()) == 1 ? 0 : 100;
    for (int round = 0; round < ROUNDS; ++round)
        for (const std::string &file : files) {
            VELMAUDIO doc = VELMAUDIO_Open(file.c_str(), "AUTO");
            if (!doc || VELMAUDIO_GetFileId(doc) <= 0) ++failures;
            VELMAUDIO_Close(doc);
        }
    if (VELMDB_CloseDatabase() != 1) ++failures;
    _exit(failures > 100 ? 100 : failures);
}

TEST_F(CatalogTest, TwoProcessesWriteAtOnce)
{
    std::vector<std::string> files;
    for (int i = 0; i < FILES; ++i) {
        files.push_back(dir.file("shared" + std::to_string(i) + ".wav"));
        std::filesystem::copy_file(sound, files.back());
    }
    pid_t children[2];
    for (pid_t &child : children) {
        child = fork();
        ASSERT_GE(child, 0);
        if (child == 0) record_in_child(database, files);
    }
    for (pid_t child : children) {
        int status = -1;
        ASSERT_EQ(waitpid(child, &status, 0), child);
        ASSERT_TRUE(WIFEXITED(status));
        EXPECT_EQ(WEXITSTATUS(status), 0);
    }

    const auto rows = Reader(database).rows();
    ASSERT_EQ(rows.size(), static_cast<size_t>(FILES));
    for (const cattest::Row &row : rows) EXPECT_EQ(row.countaccess, 2 * ROUNDS) << row.filename;
}

} // namespace
