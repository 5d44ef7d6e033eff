#pragma once

#include "Document/Hash.h"
#include "Document/ShortTextCache.h"
#include "Document/SpinLock.h"
#include "Document/YAMLScalar.h"

#include <array>
#include <atomic>
#include <string_view>

namespace ovrin_yaml {

/// The set of all interned scalars: a hash table cut into shards by the upper bits of the hash.
///
///     shard 0   slots -> [ . s s . s s . . ]     open addressing, linear probing, at most two thirds full
///     ...
///     shard 63  slots -> [ s . . . ]
///
/// A text that is known is found without a lock: slots are only ever filled, never emptied or changed, so a
/// reader sees either the scalar or an empty slot. Only the second case takes the shard's lock, looks again
/// and fills the slot. A full shard gets a table of twice the size; the old one stays readable for those who
/// still look at it, and they fall through to the lock if it lacks the scalar.
class ScalarTable {
public:
    constexpr ScalarTable() = default;
    static ScalarTable& Instance() { return s_Instance; }

    /// The one scalar of `text`; a new one gets `line`.
    YAMLScalar* Intern(std::string_view text, std::uint32_t line) { return Intern(text, HashOf(text), line); }

    // Looking up one text after the other means waiting for memory twice each time, for the slot and for the
    // scalar that it holds. Who has many texts asks for all slots, then for all scalars, and then for the
    // results.

    static std::uint32_t HashOf(std::string_view text) { return MurmurHash3(text, kScalarSeed); }
    static std::uint32_t HashOf(const ShortTextCache::Words& text) {
        return MurmurHash3(text.low, text.high, text.length, kScalarSeed);
    }
    /// Starts to load the slot of a text with this hash.
    void PrefetchSlot(std::uint32_t hash) const;
    /// Starts to load the scalar that the slot of a text with this hash holds.
    void PrefetchScalar(std::uint32_t hash) const;
    YAMLScalar* Intern(std::string_view text, std::uint32_t hash, std::uint32_t line);

    /// Makes room for that many scalars in all. Not while other threads use the table.
    void Reserve(std::size_t count);

private:
    static constexpr unsigned kShardBits = 6;

    /// Scalar hashes enter container hashes, which decide what counts as equal: the seed is part of the
    /// system.
    static constexpr std::uint32_t kScalarSeed = 42;

    /// A scalar's address with 16 bits of its hash above it, so that most probes of other scalars need not
    /// look into memory elsewhere. User addresses have 47 bits on the platforms served.
    using Slot = std::atomic<std::uint64_t>;

    struct Slots {
        std::size_t capacity;
        Slot* entries;

        /// The place of a hash: the bits behind those of the shard, as a part of the capacity.
        std::size_t PlaceOf(std::uint32_t hash) const {
            return std::uint64_t{hash << kShardBits} * capacity >> 32;
        }
        std::size_t Behind(std::size_t place) const { return place + 1 == capacity ? 0 : place + 1; }
    };

    struct alignas(64) Shard {
        std::atomic<const Slots*> slots{nullptr};
        SpinLock lock; // held for a few instructions, or seldom for those of Grow
        std::size_t count = 0;
    };

    static constexpr std::size_t kFirstCapacity = 64;

    Shard& ShardOf(std::uint32_t hash) { return m_Shards[hash >> (32 - kShardBits)]; }
    const Slot* SlotOf(std::uint32_t hash) const;
    /// What stands where a text belongs: its scalar, or the empty slot that it would take.
    struct Place {
        YAMLScalar* scalar;
        Slot* slot;
    };
    struct NewScalar {
        std::string_view text;
        std::uint32_t hash;
        std::uint32_t line;
    };
    static YAMLScalar* InternNew(Shard& shard, const NewScalar& wanted, const Slots* seen, Slot* empty);
    static Place Find(const Slots& slots, std::string_view text, std::uint32_t hash);
    static void Fill(const Slots& slots, YAMLScalar* scalar);
    static YAMLScalar* Make(const NewScalar& wanted);
    /// Gives the shard an empty table in `memory`, which stays until the process ends, and fills it.
    static void Grow(Shard& shard, std::size_t capacity, void* memory);

    static ScalarTable s_Instance;

    std::array<Shard, std::size_t{1} << kShardBits> m_Shards;
};

} // namespace ovrin_yaml
