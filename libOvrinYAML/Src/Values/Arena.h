#pragma once

#include <cstddef>
#include <new>

#if defined(__SANITIZE_ADDRESS__)
#define OVRIN_SINGLE_ALLOCATIONS
#elif defined(__has_feature)
#if __has_feature(address_sanitizer)
#define OVRIN_SINGLE_ALLOCATIONS
#endif
#endif

namespace ovrin_yaml {

/// Memory for the many small objects of value trees and diffs.
///
/// Each thread carves its requests from chunks of its own, so that no lock is taken. Memory lives until the
/// process ends, whichever thread asked for it and whether or not that thread is still there; single pieces
/// are never given back to the system. Under AddressSanitizer every request is an allocation of its own, so
/// that overruns are seen.
///
/// Returns `bytes` bytes, aligned for any pointer or integer. Throws std::bad_alloc when there is no memory.
inline void* ArenaAllocate(std::size_t bytes);

/// The same for a single big piece that is zero throughout, which costs nothing before it is used.
void* AllocateZeroed(std::size_t bytes);

/// Asks the system for huge pages behind a big piece of memory: fewer page faults, fewer address look-ups.
/// Small pieces stay as they are.
void AdviseHugePages(void* memory, std::size_t bytes);

/// A stateless allocator for std::vector over ArenaAllocate. What a growing vector leaves behind stays in the
/// arena, so reserve where the count is known.
template <class T> struct ArenaAllocator {
    using value_type = T;

    ArenaAllocator() = default;
    template <class U> ArenaAllocator(const ArenaAllocator<U>&) {}

    T* allocate(std::size_t count) { return static_cast<T*>(ArenaAllocate(count * sizeof(T))); }
    void deallocate(T*, std::size_t) {}

    template <class U> bool operator==(const ArenaAllocator<U>&) const { return true; }
};

/// Memory for a big piece that is given back, on huge pages from its first byte on where it fills some.
void* AllocateOnHugePages(std::size_t bytes);
void FreeOnHugePages(void* memory);

/// A stateless allocator for big arrays over these.
template <class T> struct HugePageAllocator {
    using value_type = T;

    HugePageAllocator() = default;
    template <class U> HugePageAllocator(const HugePageAllocator<U>&) {}

    T* allocate(std::size_t count) { return static_cast<T*>(AllocateOnHugePages(count * sizeof(T))); }
    void deallocate(T* memory, std::size_t) { FreeOnHugePages(memory); }

    template <class U> bool operator==(const HugePageAllocator<U>&) const { return true; }
};

#if defined(OVRIN_SINGLE_ALLOCATIONS)

inline void* ArenaAllocate(std::size_t bytes) {
    return ::operator new(bytes);
}

#else

/// What is left of the chunk that a thread carves its requests from.
struct ThreadArena {
    static constexpr std::size_t kAlignment = 8;

    char* position = nullptr;
    std::size_t left = 0;
    std::size_t nextChunk = std::size_t{64} << 10;

    /// The same as ArenaAllocate, where nothing fits into what is left.
    void* AllocateFromNewChunk(std::size_t bytes);

    static ThreadArena& OfThread() {
        static constinit thread_local ThreadArena arena;
        return arena;
    }
};

inline void* ArenaAllocate(std::size_t bytes) {
    bytes = (bytes + ThreadArena::kAlignment - 1) & ~(ThreadArena::kAlignment - 1);
    ThreadArena& arena = ThreadArena::OfThread();
    if (bytes > arena.left) return arena.AllocateFromNewChunk(bytes);
    char* piece = arena.position;
    arena.position += bytes;
    arena.left -= bytes;
    return piece;
}

#endif

} // namespace ovrin_yaml
