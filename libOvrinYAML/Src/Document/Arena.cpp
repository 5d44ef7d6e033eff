#include "Document/Arena.h"

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <new>

#include <sys/mman.h>

namespace ovrin_yaml {

namespace {

constexpr std::size_t kHugePage = std::size_t{2} << 20;

void* ThrowIfNull(void* memory) {
    if (!memory) throw std::bad_alloc();
    return memory;
}

} // namespace

void AdviseHugePages(void* memory, std::size_t bytes) {
    const std::uintptr_t begin =
        (reinterpret_cast<std::uintptr_t>(memory) + kHugePage - 1) & ~(kHugePage - 1);
    const std::uintptr_t end = (reinterpret_cast<std::uintptr_t>(memory) + bytes) & ~(kHugePage - 1);
    // Advice only: where it can't be followed nothing else changes.
    if (begin < end) madvise(reinterpret_cast<void*>(begin), end - begin, MADV_HUGEPAGE);
}

void* AllocateZeroed(std::size_t bytes) {
    void* memory = ThrowIfNull(std::calloc(bytes, 1));
    AdviseHugePages(memory, bytes);
    return memory;
}

#if defined(__SANITIZE_ADDRESS__)
#define OVRIN_SINGLE_ALLOCATIONS
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define OVRIN_SINGLE_ALLOCATIONS
#endif
#endif

#if defined(OVRIN_SINGLE_ALLOCATIONS)

void* ArenaAllocate(std::size_t bytes) {
    return ::operator new(bytes);
}

#else

namespace {

constexpr std::size_t kAlignment = 8;
constexpr std::size_t kFirstChunk = std::size_t{64} << 10;
constexpr std::size_t kLargestChunk = 2 * kHugePage;

struct ThreadArena {
    char* position = nullptr;
    std::size_t left = 0;
    std::size_t nextChunk = kFirstChunk;
};

thread_local ThreadArena t_Arena;

char* AllocateChunk(std::size_t bytes) {
    if (bytes < kHugePage) return static_cast<char*>(::operator new(bytes));
    char* chunk = static_cast<char*>(ThrowIfNull(std::aligned_alloc(kHugePage, bytes)));
    AdviseHugePages(chunk, bytes);
    return chunk;
}

/// Small programs touch little memory, large ones ask for chunks seldom: chunks double up to a bound.
void* AllocateFromNewChunk(ThreadArena& arena, std::size_t bytes) {
    if (bytes > arena.nextChunk / 4) return ::operator new(bytes);
    arena.position = AllocateChunk(arena.nextChunk);
    arena.left = arena.nextChunk - bytes;
    arena.nextChunk = std::min(arena.nextChunk * 2, kLargestChunk);
    char* piece = arena.position;
    arena.position += bytes;
    return piece;
}

} // namespace

void* ArenaAllocate(std::size_t bytes) {
    bytes = (bytes + kAlignment - 1) & ~(kAlignment - 1);
    ThreadArena& arena = t_Arena;
    if (bytes > arena.left) return AllocateFromNewChunk(arena, bytes);
    char* piece = arena.position;
    arena.position += bytes;
    arena.left -= bytes;
    return piece;
}

#endif

} // namespace ovrin_yaml
