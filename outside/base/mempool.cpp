/*
 * Memory pools.  Every block is its own heap allocation, tracked by its pool,
 * so AddressSanitizer sees each block's bounds and a disposed pool frees all
 * of its blocks at once.
 */
#include "outside/base/blbase.h"

#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <mutex>
#include <string>
#include <unordered_map>

struct BLMemPool {
    std::string name;
    bool threadsafe = false;
    std::mutex lock;
    std::unordered_map<void *, size_t> blocks;
    int64_t live_bytes = 0;

    // Pools made without BLMEM_FLAG_THREADSAFE belong to one thread and skip the lock.
    std::unique_lock<std::mutex> Guard()
    {
        return threadsafe ? std::unique_lock(lock) : std::unique_lock<std::mutex>();
    }

    void FreeAll()
    {
        for (auto &[block, size] : blocks) std::free(block);
        blocks.clear();
        live_bytes = 0;
    }
};

BLMEM BLMEM_CreateMemDescrEx(const char *name, size_t initial_size, int flags)
{
    auto *pool = new (std::nothrow) BLMemPool;
    if (!pool) return nullptr;
    pool->name = name ? name : "";
    pool->threadsafe = (flags & BLMEM_FLAG_THREADSAFE) != 0;
    return pool;
}

int BLMEM_DisposeMemDescr(BLMEM pool)
{
    if (!pool) return 0;
    pool->FreeAll();
    delete pool;
    return 1;
}

void *BLMEM_New(BLMEM pool, size_t size)
{
    if (!pool || size > BLMEM_MAX_BLOCK_SIZE) return nullptr;
    // A zero-size request still gets a distinct block, as callers compare pointers.
    void *block = std::calloc(1, size ? size : 1);
    if (!block) {
        BLDEBUG_Error(-1, "BLMEM_New: %s: unable to allocate %zu bytes", pool->name.c_str(), size);
        return nullptr;
    }
    auto guard = pool->Guard();
    try {
        pool->blocks.emplace(block, size);
    } catch (const std::bad_alloc &) {
        std::free(block);
        return nullptr;
    }
    pool->live_bytes += static_cast<int64_t>(size);
    return block;
}

int BLMEM_Delete(BLMEM pool, void *block)
{
    if (!pool || !block) return 0;
    auto guard = pool->Guard();
    const auto found = pool->blocks.find(block);
    if (found == pool->blocks.end()) return 0;
    pool->live_bytes -= static_cast<int64_t>(found->second);
    pool->blocks.erase(found);
    std::free(block);
    return 1;
}

int BLMEM_ResetMemSpace(BLMEM pool)
{
    if (!pool) return 0;
    auto guard = pool->Guard();
    pool->FreeAll();
    return 1;
}

int BLMEM_FreeUnusedMemory(BLMEM pool)
{
    if (!pool) return 0;
    {
        auto guard = pool->Guard();
        pool->blocks.rehash(0);
    }
    // Blocks go back to the heap when freed; this hands the heap's spare pages back.
    malloc_trim(0);
    return 1;
}

int64_t BLMEM_SizeInMemory(BLMEM pool)
{
    if (!pool) return -1;
    auto guard = pool->Guard();
    return pool->live_bytes;
}

const char *BLMEM_Name(BLMEM pool)
{
    return pool ? pool->name.c_str() : nullptr;
}

void *BLMEM_OverlapMemCopy(void *dst, const void *src, size_t size)
{
    if (!dst || !src) return nullptr;
    return std::memmove(dst, src, size);
}
