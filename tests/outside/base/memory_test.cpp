#include "base_test_support.h"

#include <cstdint>
#include <cstring>
#include <thread>
#include <vector>

using MemoryPool = BaseTest;

TEST_F(MemoryPool, BlocksAreZeroFilledAndCounted)
{
    BLMEM pool = BLMEM_CreateMemDescrEx("Test Memory", 0, 0);
    ASSERT_NE(pool, nullptr);
    EXPECT_STREQ(BLMEM_Name(pool), "Test Memory");
    auto *bytes = static_cast<unsigned char *>(BLMEM_New(pool, 1000));
    ASSERT_NE(bytes, nullptr);
    for (int i = 0; i < 1000; ++i) ASSERT_EQ(bytes[i], 0) << "byte " << i;
    std::memset(bytes, 0xAB, 1000);
    EXPECT_NE(BLMEM_New(pool, 24), nullptr);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 1024);
    EXPECT_EQ(BLMEM_Delete(pool, bytes), 1);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 24);
    EXPECT_EQ(BLMEM_DisposeMemDescr(pool), 1);
}

TEST_F(MemoryPool, DeleteRefusesBlocksItDoesNotOwn)
{
    BLMEM a = BLMEM_CreateMemDescrEx("A", 0, 0);
    BLMEM b = BLMEM_CreateMemDescrEx("B", 0, 0);
    void *from_a = BLMEM_New(a, 64);
    int on_stack = 0;
    EXPECT_EQ(BLMEM_Delete(b, from_a), 0);
    EXPECT_EQ(BLMEM_Delete(a, &on_stack), 0);
    EXPECT_EQ(BLMEM_Delete(a, static_cast<char *>(from_a) + 8), 0);
    EXPECT_EQ(BLMEM_SizeInMemory(a), 64);
    EXPECT_EQ(BLMEM_Delete(a, from_a), 1);
    EXPECT_EQ(BLMEM_Delete(a, from_a), 0) << "a block is deleted once";
    BLMEM_DisposeMemDescr(a);
    BLMEM_DisposeMemDescr(b);
}

// Disposing frees every block (AddressSanitizer's leak check would report any
// block left behind); resetting keeps the pool usable.
TEST_F(MemoryPool, DisposeAndResetReleaseEveryBlock)
{
    BLMEM pool = BLMEM_CreateMemDescrEx("Many", 4096, 0);
    for (int i = 1; i <= 100; ++i) ASSERT_NE(BLMEM_New(pool, static_cast<size_t>(i)), nullptr);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 5050);
    EXPECT_EQ(BLMEM_ResetMemSpace(pool), 1);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 0);
    void *again = BLMEM_New(pool, 16);
    EXPECT_NE(again, nullptr);
    EXPECT_EQ(BLMEM_FreeUnusedMemory(pool), 1);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 16);
    EXPECT_EQ(BLMEM_DisposeMemDescr(pool), 1);
}

TEST_F(MemoryPool, AbsurdSizesAndNullHandlesFail)
{
    BLMEM pool = BLMEM_CreateMemDescrEx(nullptr, 0, 0);
    ASSERT_NE(pool, nullptr);
    EXPECT_STREQ(BLMEM_Name(pool), "");
    EXPECT_EQ(BLMEM_New(pool, SIZE_MAX), nullptr);
    EXPECT_EQ(BLMEM_New(pool, BLMEM_MAX_BLOCK_SIZE + 1), nullptr);
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 0);
    void *empty = BLMEM_New(pool, 0);
    void *other = BLMEM_New(pool, 0);
    EXPECT_NE(empty, nullptr);
    EXPECT_NE(empty, other);
    BLMEM_DisposeMemDescr(pool);

    EXPECT_EQ(BLMEM_New(nullptr, 8), nullptr);
    EXPECT_EQ(BLMEM_Delete(nullptr, &pool), 0);
    EXPECT_EQ(BLMEM_DisposeMemDescr(nullptr), 0);
    EXPECT_EQ(BLMEM_ResetMemSpace(nullptr), 0);
    EXPECT_EQ(BLMEM_FreeUnusedMemory(nullptr), 0);
    EXPECT_EQ(BLMEM_SizeInMemory(nullptr), -1);
    EXPECT_EQ(BLMEM_Name(nullptr), nullptr);
}

TEST_F(MemoryPool, ThreadSafePoolTakesBlocksFromManyThreads)
{
    BLMEM pool = BLMEM_CreateMemDescrEx("Shared", 0, BLMEM_FLAG_THREADSAFE);
    std::vector<std::thread> workers;
    for (int t = 0; t < 4; ++t)
        workers.emplace_back([pool] {
            for (int i = 0; i < 500; ++i) {
                void *keep = BLMEM_New(pool, 8);
                void *drop = BLMEM_New(pool, 32);
                ASSERT_NE(keep, nullptr);
                ASSERT_EQ(BLMEM_Delete(pool, drop), 1);
            }
        });
    for (auto &w : workers) w.join();
    EXPECT_EQ(BLMEM_SizeInMemory(pool), 4 * 500 * 8);
    BLMEM_DisposeMemDescr(pool);
}

TEST_F(MemoryPool, OverlapCopyMovesInsideOneBuffer)
{
    char text[] = "abcdefgh";
    EXPECT_EQ(BLMEM_OverlapMemCopy(text + 2, text, 5), text + 2);
    EXPECT_STREQ(text, "ababcdeh");
    EXPECT_EQ(BLMEM_OverlapMemCopy(nullptr, text, 1), nullptr);
    EXPECT_EQ(BLMEM_OverlapMemCopy(text, nullptr, 1), nullptr);
}
