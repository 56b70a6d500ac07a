#include "base_test_support.h"

#include <csignal>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <string>
#include <sys/resource.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

std::string ReadAll(const fs::path &path)
{
    std::ifstream in(path, std::ios::binary);
    std::stringstream text;
    text << in.rdbuf();
    return text.str();
}

void WriteAll(const fs::path &path, const std::string &text)
{
    std::ofstream(path, std::ios::binary) << text;
}

// A fresh folder per test, removed afterwards.
class IniFile : public BaseTest {
protected:
    void SetUp() override
    {
        BaseTest::SetUp();
        folder = fs::path(VELM_TEST_BINARY_DIR) /
                 ("ini_" + std::string(::testing::UnitTest::GetInstance()->current_test_info()->name()));
        fs::remove_all(folder);
        fs::create_directories(folder);
        path = folder / "settings.ini";
    }
    void TearDown() override
    {
        BaseTest::TearDown();
        fs::permissions(folder, fs::perms::owner_all, fs::perm_options::add);
        fs::remove_all(folder);
    }
    // A settings object bound to the file, which holds one value; before is its text.
    BLSETTINGS BindWithOneValue(std::string &before)
    {
        BLSETTINGS s = BLSETTINGS_Create();
        EXPECT_EQ(BLSETTINGS_SetConfigFileEx(s, path.c_str(), "ini"), 1);
        BLSETTINGS_ChangeEx(s, "keep.me=1");
        before = ReadAll(path);
        EXPECT_NE(before.find("me=1"), std::string::npos);
        return s;
    }
    fs::path folder, path;
};

} // namespace

TEST_F(IniFile, ValuesSurviveARoundTrip)
{
    BLSETTINGS s = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(s, path.c_str(), "ini"), 1);
    EXPECT_FALSE(fs::exists(path)) << "nothing is written before a change";
    BLSETTINGS_SetDefaultEx(s, "libvelm.draw.hovertime=500");
    BLSETTINGS_ChangeEx(s, "libvelm.Draw.Color=%d", -16777216);
    BLSETTINGS_ChangeEx(s, "libvelm.playback.devicename=%s", "hw:0,0");
    BLSETTINGS_ChangeEx(s, "dspb.fftw.prepare_plans=1");
    BLSETTINGS_ChangeEx(s, "toplevel=yes");
    BLSETTINGS_ChangeEx(s, "text.multiline=%s", "one\ntwo \\ three");
    BLSETTINGS_ChangeEx(s, "text.brace=%s", "{obscured}00");
    BLSETTINGS_ChangeSecretEx(s, "net.password=%s", "hunter2");
    BLSETTINGS_Destroy(s);

    const std::string text = ReadAll(path);
    EXPECT_NE(text.find("[libvelm]\n"), std::string::npos) << text;
    EXPECT_NE(text.find("Draw.Color=-16777216\n"), std::string::npos) << text;
    EXPECT_EQ(text.find("hovertime"), std::string::npos) << "defaults are not written";
    EXPECT_EQ(text.find("hunter2"), std::string::npos) << "secrets are obscured";
    EXPECT_LT(text.find("toplevel=yes"), text.find("\n[")) << "keys without a section come first";

    BLSETTINGS t = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(t, path.c_str(), "INI"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(t, "libvelm.draw.color"), -16777216);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(t, "libvelm.playback.devicename"), "hw:0,0");
    EXPECT_EQ(BLSETTINGS_GetBoolEx(t, "dspb.fftw.prepare_plans"), 1);
    EXPECT_EQ(BLSETTINGS_GetBoolEx(t, "toplevel"), 1);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(t, "text.multiline"), "one\ntwo \\ three");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(t, "text.brace"), "{obscured}00");
    EXPECT_STREQ(BLSETTINGS_GetSecretStringEx(t, "net.password"), "hunter2");
    EXPECT_EQ(BLSETTINGS_ExistsEx(t, "libvelm.draw.hovertime"), 0);

    // Deleting a key writes the file without it.
    EXPECT_EQ(BLSETTINGS_DeleteEx(t, "dspb.fftw.prepare_plans"), 1);
    EXPECT_EQ(ReadAll(path).find("prepare_plans"), std::string::npos);
    BLSETTINGS_Destroy(t);
}

TEST_F(IniFile, TheGlobalRegistryCanBeBacked)
{
    WriteAll(path, "[libvelm]\ndraw.hovertime=700\n");
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(nullptr, path.c_str(), "ini"), 1);
    BLSETTINGS_SetDefaultEx(nullptr, "libvelm.draw.hovertime=500");
    EXPECT_EQ(BLSETTINGS_GetIntEx(nullptr, "libvelm.draw.hovertime"), 700);
}

TEST_F(IniFile, DottedSectionHeadersNameTheLeadingPartsOfTheirKeys)
{
    WriteAll(path, "[velm.link]\nfile=speech.wav\noptions=readonly\n[velm]\nlink.format=WAVE\n[.bad]\nlost=1\n");
    BLSETTINGS s = BLSETTINGS_Create();
    LogCapture log;
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(s, path.c_str(), "ini"), 1);
    EXPECT_STREQ(BLSETTINGS_GetStringEx(s, "velm.link.file"), "speech.wav");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(s, "velm.link.options"), "readonly");
    EXPECT_STREQ(BLSETTINGS_GetStringEx(s, "velm.link.format"), "WAVE");
    EXPECT_EQ(BLSETTINGS_ExistsEx(s, ".bad.lost"), 0);
    EXPECT_EQ(BLSETTINGS_ExistsEx(s, "lost"), 0);
    BLSETTINGS_Destroy(s);
}

TEST_F(IniFile, DamagedFileLoadsWhatItCanAndIsNotRewrittenByReading)
{
    using namespace std::string_literals;
    const std::string junk = "[libvelm]\n"
                             "draw.good=1\n"
                             "this line has no equals sign\n"
                             "=no key\n"
                             "draw.long=" + std::string(200000, 'x') + "\n"
                             "\x01\x02\xff\xfe=binary\n"
                             "bin\0ary=1\n"s
                             "[broken section\n"
                             "lost=1\n"
                             "[other]\n"
                             "secret={obscured}XYZ\n"
                             "after=2\n"
                             "\0\0\0garbage"s;
    WriteAll(path, junk);
    const auto size_before = fs::file_size(path);

    LogCapture log;
    BLSETTINGS s = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(s, path.c_str(), "ini"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(s, "libvelm.draw.good"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(s, "other.after"), 2);
    EXPECT_EQ(BLSETTINGS_ExistsEx(s, "libvelm.draw.long"), 0);
    EXPECT_EQ(BLSETTINGS_ExistsEx(s, "lost"), 0);
    EXPECT_EQ(BLSETTINGS_ExistsEx(s, "other.secret"), 0);
    EXPECT_GE(log.messages.size(), 7u) << "each unreadable line is reported";
    EXPECT_EQ(fs::file_size(path), size_before) << "reading never rewrites the file";
    EXPECT_EQ(ReadAll(path), junk);

    // The first write keeps the damaged original beside the new file.
    BLSETTINGS_ChangeEx(s, "libvelm.draw.good=3");
    EXPECT_EQ(ReadAll(folder / "settings.ini.bak"), junk);
    BLSETTINGS_Destroy(s);
    BLSETTINGS t = BLSETTINGS_Create();
    ASSERT_EQ(BLSETTINGS_SetConfigFileEx(t, path.c_str(), "ini"), 1);
    EXPECT_EQ(BLSETTINGS_GetIntEx(t, "libvelm.draw.good"), 3);
    EXPECT_EQ(BLSETTINGS_GetIntEx(t, "other.after"), 2);
    BLSETTINGS_Destroy(t);
}

TEST_F(IniFile, FoldersAndOversizedFilesAreRefused)
{
    BLSETTINGS s = BLSETTINGS_Create();
    EXPECT_EQ(BLSETTINGS_SetConfigFileEx(s, folder.c_str(), "ini"), 0);
    WriteAll(path, "a=1\n");
    fs::resize_file(path, BLSETTINGS_MAX_FILE_SIZE + 1);
    EXPECT_EQ(BLSETTINGS_SetConfigFileEx(s, path.c_str(), "ini"), 0);
    EXPECT_EQ(fs::file_size(path), BLSETTINGS_MAX_FILE_SIZE + 1u);
    BLSETTINGS_Destroy(s);
}

// A write that fails leaves the old file whole.
TEST_F(IniFile, FailedWriteInReadOnlyFolderKeepsTheOldFile)
{
    std::string before;
    BLSETTINGS s = BindWithOneValue(before);
    fs::permissions(folder, fs::perms::owner_read | fs::perms::owner_exec);
    if (::access(folder.c_str(), W_OK) == 0) {
        BLSETTINGS_Destroy(s);
        GTEST_SKIP() << "permissions do not bind this user (root)";
    }
    LogCapture log;
    EXPECT_EQ(BLSETTINGS_ChangeEx(s, "keep.me=2"), 1) << "the value itself changes";
    EXPECT_EQ(ReadAll(path), before);
    EXPECT_FALSE(log.messages.empty()) << "the failed write is reported";
    BLSETTINGS_Destroy(s);
}

TEST_F(IniFile, FailedWriteOfAFullDiskKeepsTheOldFile)
{
    std::string before;
    BLSETTINGS s = BindWithOneValue(before);

    // A file size limit makes every longer write fail, as a full disk would.
    struct rlimit old_limit;
    ASSERT_EQ(getrlimit(RLIMIT_FSIZE, &old_limit), 0);
    auto *old_handler = std::signal(SIGXFSZ, SIG_IGN);
    struct rlimit small = old_limit;
    small.rlim_cur = before.size();
    ASSERT_EQ(setrlimit(RLIMIT_FSIZE, &small), 0);
    LogCapture log;
    BLSETTINGS_ChangeEx(s, "keep.me=%s", std::string(4096, 'y').c_str());
    setrlimit(RLIMIT_FSIZE, &old_limit);
    std::signal(SIGXFSZ, old_handler);

    EXPECT_EQ(ReadAll(path), before);
    EXPECT_FALSE(log.messages.empty());
    for (const auto &entry : fs::directory_iterator(folder))
        EXPECT_EQ(entry.path().filename(), "settings.ini") << "no temporary file is left";
    BLSETTINGS_Destroy(s);
}
