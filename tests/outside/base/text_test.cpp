#include "base_test_support.h"

#include <cstring>
#include <filesystem>
#include <fstream>
#include <string>

namespace fs = std::filesystem;

TEST(DoubleText, VectorRoundTrip)
{
    const double values[] = {0.5, -1, 1e-10, 3.141592653589793, 48000};
    char buffer[128];
    const int length = BLSTRING_SetDoubleVectorToString(values, 5, buffer, sizeof buffer);
    EXPECT_STREQ(buffer, "[0.5,-1,1e-10,3.141592653589793,48000]");
    EXPECT_EQ(length, static_cast<int>(std::strlen(buffer)));
    double back[5] = {};
    ASSERT_EQ(BLSTRING_GetDoubleVectorFromString(buffer, back, 5), 5);
    for (int i = 0; i < 5; ++i) EXPECT_EQ(back[i], values[i]) << i;

    EXPECT_EQ(BLSTRING_SetDoubleVectorToString(values, 0, buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "[]");
    EXPECT_EQ(BLSTRING_GetDoubleVectorFromString(" [ 1 , +2.5,-3e2 ] ", back, 5), 3);
    EXPECT_EQ(back[1], 2.5);
    EXPECT_EQ(back[2], -300);
    EXPECT_EQ(BLSTRING_GetDoubleVectorFromString("[1,2,3]", nullptr, 0), 3) << "counting only";
}

TEST(DoubleText, VectorRefusesSmallBuffersAndMalformedText)
{
    const double values[] = {1.25, 2.5, 3.75};
    char small[8] = "junk";
    EXPECT_EQ(BLSTRING_SetDoubleVectorToString(values, 3, small, sizeof small), -1);
    EXPECT_STREQ(small, "");
    EXPECT_EQ(BLSTRING_SetDoubleVectorToString(nullptr, 3, small, sizeof small), -1);
    EXPECT_EQ(BLSTRING_SetDoubleVectorToString(values, 3, nullptr, 8), -1);

    double out[2];
    const char *bad[] = {"", "1,2", "[1,2", "[1,,2]", "[1 2]", "[a]", "[1]x", "[,]", "[1,]"};
    for (const char *text : bad) EXPECT_EQ(BLSTRING_GetDoubleVectorFromString(text, out, 2), -1) << text;
    EXPECT_EQ(BLSTRING_GetDoubleVectorFromString("[1,2,3]", out, 2), -1) << "over capacity";
    EXPECT_EQ(BLSTRING_GetDoubleVectorFromString(nullptr, out, 2), -1);
}

TEST(DoubleText, MatrixRoundTrip)
{
    const double gains[] = {1, 0.5, 0, -0.25, 2, 3};
    char buffer[256];
    ASSERT_GT(BLSTRING_SetDoubleMatrixToString(gains, 2, 3, buffer, sizeof buffer), 0);
    EXPECT_STREQ(buffer, "[[1,0.5,0],[-0.25,2,3]]");
    double back[6];
    int rows = 0, columns = 0;
    EXPECT_EQ(BLSTRING_GetDoubleMatrixFromString(buffer, back, 6, &rows, &columns), 6);
    EXPECT_EQ(rows, 2);
    EXPECT_EQ(columns, 3);
    for (int i = 0; i < 6; ++i) EXPECT_EQ(back[i], gains[i]);

    EXPECT_EQ(BLSTRING_SetDoubleMatrixToString(gains, 0, 3, buffer, sizeof buffer), 2);
    EXPECT_STREQ(buffer, "[]");
    EXPECT_EQ(BLSTRING_GetDoubleMatrixFromString("[]", back, 6, &rows, &columns), 0);
    EXPECT_EQ(rows, 0);
    EXPECT_EQ(BLSTRING_GetDoubleMatrixFromString("[[1,2],[3]]", back, 6, &rows, &columns), -1)
        << "ragged rows";
    EXPECT_EQ(BLSTRING_GetDoubleMatrixFromString("[[1,2],[3,4]]", back, 3, &rows, &columns), -1);
    EXPECT_EQ(BLSTRING_GetDoubleMatrixFromString("[1,2]", back, 6, &rows, &columns), -1);
    char small[10];
    EXPECT_EQ(BLSTRING_SetDoubleMatrixToString(gains, 2, 3, small, sizeof small), -1);
}

class Files : public BaseTest {
protected:
    void SetUp() override
    {
        BaseTest::SetUp();
        folder = fs::path(VELM_TEST_BINARY_DIR) / "files_test";
        fs::remove_all(folder);
        fs::create_directories(folder / "sub");
        file = folder / "sub" / "a.wav";
        std::ofstream(file) << "data";
    }
    void TearDown() override
    {
        fs::remove_all(folder);
        BaseTest::TearDown();
    }
    fs::path folder, file;
};

TEST_F(Files, KindsAndExistence)
{
    EXPECT_EQ(BLIO_GetHFileKind(file.c_str()), 1);
    EXPECT_EQ(BLIO_GetHFileKind(folder.c_str()), 2);
    EXPECT_EQ(BLIO_GetHFileKind("/dev/null"), 3);
    EXPECT_EQ(BLIO_GetHFileKind((folder / "none").c_str()), 0);
    EXPECT_EQ(BLIO_GetHFileKind(nullptr), 0);
    EXPECT_TRUE(BLIO_FileExists(file.c_str()));
    EXPECT_FALSE(BLIO_FileExists((folder / "none").c_str()));
    EXPECT_FALSE(BLIO_FileExists(""));
}

TEST_F(Files, CanonicalNamesAreAbsoluteTidyAndCut)
{
    char buffer[1024];
    const std::string messy = (folder / "sub" / ".." / "sub" / "." / "a.wav").string();
    ASSERT_NE(BLIO_ExtractCanonicalFileName(messy.c_str(), buffer, sizeof buffer), nullptr);
    EXPECT_EQ(fs::path(buffer), fs::canonical(file));

    // A name that does not exist yet is still made absolute and tidy.
    const fs::path cwd = fs::current_path();
    fs::current_path(folder);
    EXPECT_NE(BLIO_ExtractCanonicalFileName("sub/../new.wav", buffer, sizeof buffer), nullptr);
    fs::current_path(cwd);
    EXPECT_EQ(fs::path(buffer), fs::canonical(folder) / "new.wav");

    char small[6];
    EXPECT_EQ(BLIO_ExtractCanonicalFileName(file.c_str(), small, sizeof small), small);
    EXPECT_EQ(std::strlen(small), 5u);
    EXPECT_EQ(std::string(small), fs::canonical(file).string().substr(0, 5));
    EXPECT_EQ(BLIO_ExtractCanonicalFileName(nullptr, buffer, 10), nullptr);
    EXPECT_EQ(BLIO_ExtractCanonicalFileName("x", buffer, 0), nullptr);
}

TEST_F(Files, FileTimesFollowTheFile)
{
    const uint64_t before = BLUTIL_GetFileTime(file.c_str(), 2);
    ASSERT_GT(before, 0u);
    EXPECT_GT(BLUTIL_GetFileTime(file.c_str(), 0), 0u);
    EXPECT_GT(BLUTIL_GetFileTime(file.c_str(), 1), 0u);
    EXPECT_EQ(BLtimeToBLtimeStamp(before), BLUTIL_GetFileTime(file.c_str(), 2))
        << "a stamp equals the unchanged file's time";
    fs::last_write_time(file, fs::last_write_time(file) + std::chrono::seconds(5));
    EXPECT_EQ(BLUTIL_GetFileTime(file.c_str(), 2), before + 5000000000ull);
    EXPECT_EQ(BLUTIL_GetFileTime((folder / "none").c_str(), 2), 0u);
    EXPECT_EQ(BLUTIL_GetFileTime(file.c_str(), 7), 0u);
    // The current time is in the same unit as file times.
    EXPECT_GE(BLgetgmtime(), before);
}

TEST(Display, SizeDefaultsAndHostValues)
{
    EXPECT_EQ(BLUTILS_GetDisplayWidth(), 1920);
    EXPECT_EQ(BLUTILS_GetDisplayHeight(), 1080);
    BLUTILS_SetDisplaySize(2560, 1440);
    EXPECT_EQ(BLUTILS_GetDisplayWidth(), 2560);
    BLUTILS_SetDisplaySize(0, -5);
    EXPECT_EQ(BLUTILS_GetDisplayHeight(), 1440) << "nonsense sizes are ignored";
    BLUTILS_SetDisplaySize(1920, 1080);
}

TEST(Lists, OrderedPointersWithIterator)
{
    int a = 1, b = 2, c = 3;
    DLList *list = DLList_Create();
    ASSERT_NE(list, nullptr);
    EXPECT_EQ(DLList_Append(list, &a), 1);
    EXPECT_EQ(DLList_Append(list, &c), 1);
    EXPECT_EQ(DLList_Insert(list, 1, &b), 1);
    EXPECT_EQ(DLList_Insert(list, 9, &b), 0);
    EXPECT_EQ(DLList_Append(list, nullptr), 0);
    EXPECT_EQ(DLList_Count(list), 3u);
    DLListIterator it;
    ASSERT_EQ(DLList_StartIterator(list, &it), 1);
    EXPECT_EQ(DLList_Next(&it), &a);
    EXPECT_EQ(DLList_Next(&it), &b);
    EXPECT_EQ(DLList_Remove(list, &a), 1);
    EXPECT_EQ(DLList_Next(&it), nullptr) << "walks by position after a removal";
    EXPECT_EQ(DLList_Get(list, 0), &b);
    EXPECT_EQ(DLList_Get(list, 5), nullptr);
    EXPECT_EQ(DLList_Remove(list, &a), 0);
    EXPECT_EQ(DLList_Count(nullptr), 0u);
    EXPECT_EQ(DLList_Next(nullptr), nullptr);
    EXPECT_EQ(DLList_Destroy(list), 1);
    EXPECT_EQ(DLList_Destroy(nullptr), 0);
}
