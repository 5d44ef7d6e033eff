#include "Document/Arena.h"

#include <algorithm>
#include <cstdint>
#include <new>

namespace ovrin_yaml {

#if defined(__SANITIZE_ADDRESS__)

void* ArenaAllocate(std::size_t bytes) {
    return ::operator new(bytes);
}

#else

namespace {

constexpr std::size_t kAlignment = 8;
constexpr std::size_t kFirstChunk = std::size_t{64} << 10;
constexpr std::size_t kLargestChunk = std::size_t{4} << 20;

struct ThreadArena {
    char* position = nullptr;
    std::size_t left = 0;
    std::size_t nextChunk = kFirstChunk;
};

thread_local ThreadArena t_Arena;

/// Small programs touch little memory, large ones ask for chunks seldom: chunks double up to a bound.
void* AllocateFromNewChunk(ThreadArena& arena, std::size_t bytes) {
    if (bytes > arena.nextChunk / 4) return ::operator new(bytes);
    arena.position = static_cast<char*>(::operator new(arena.nextChunk));
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
