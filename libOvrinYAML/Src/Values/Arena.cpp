#include "Values/Arena.h"

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

void* AllocateOnHugePages(std::size_t bytes) {
    if (bytes < kHugePage) return ThrowIfNull(std::malloc(bytes));
    // Unlike std::aligned_alloc it takes any size.
    void* memory = nullptr;
    if (posix_memalign(&memory, kHugePage, bytes) != 0) throw std::bad_alloc();
    AdviseHugePages(memory, bytes);
    return memory;
}

void FreeOnHugePages(void* memory) {
    std::free(memory);
}

#if !defined(OVRIN_SINGLE_ALLOCATIONS)

namespace {

constexpr std::size_t kLargestChunk = 2 * kHugePage;

} // namespace

/// Small programs touch little memory, large ones ask for chunks seldom: chunks double up to a bound.
void* ThreadArena::AllocateFromNewChunk(std::size_t bytes) {
    if (bytes >= kHugePage / 2) return AllocateOnHugePages((bytes + kHugePage - 1) & ~(kHugePage - 1));
    if (bytes > nextChunk / 4) return ::operator new(bytes);
    position = static_cast<char*>(AllocateOnHugePages(nextChunk));
    left = nextChunk - bytes;
    nextChunk = std::min(nextChunk * 2, kLargestChunk);
    char* piece = position;
    position += bytes;
    return piece;
}

#endif

} // namespace ovrin_yaml
