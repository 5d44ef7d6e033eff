#pragma once

#include "Values/Hash.h"
#include "Values/SeededHash.h"
#include "Values/ShortText.h"
#include "Values/SpinLock.h"
#include "Values/YAMLScalar.h"

#include <array>
#include <atomic>
#include <string_view>
#include <unordered_set>

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
///
/// The hash is known to all, so a file may hold any number of texts that belong into one place. A walk along
/// the slots therefore ends after kMostProbes of them, or kMostAlike that hold a scalar of the same tag: what
/// it hasn't found by then is in the shard's overflow, a set under the lock with a hash that nobody can
/// foretell.
///
///     slots -> [ s s s s ... s s s . ]           a walk from the first slot ends here: no place
///                |<- kMostProbes ->|                    overflow -> { s, s, s }
///
/// Since slots are only filled, a walk that ended without a place ends so in this table for ever, and one
/// that met its scalar always meets it: a text is either in a slot or in the overflow. A bigger table offers
/// new places, so Grow places all scalars anew, those of the overflow too.
class ScalarTable {
public:
    constexpr ScalarTable() = default;
    static ScalarTable& Instance() { return s_Instance; }

    /// The one scalar of `text`; a new one gets `line`. Throws YAMLError "Scalar is too long" for a text of 4
    /// GiB or more.
    YAMLScalar* Intern(std::string_view text, std::uint32_t line);

    // Looking up one text after the other means waiting for memory twice each time, for the slot and for the
    // scalar that it holds. Who has many texts asks for all slots, then for all scalars, and then for the
    // results.

    static std::uint32_t HashOf(std::string_view text) { return MurmurHash3(text, kScalarSeed); }
    static std::uint32_t HashOf(const ShortText& text) {
        return MurmurHash3(text.low, text.high, text.length, kScalarSeed);
    }
    /// Starts to load the slot of a text with this hash.
    void PrefetchSlot(std::uint32_t hash) const;
    /// Starts to load the scalar that the slot of a text with this hash holds.
    void PrefetchScalar(std::uint32_t hash) const;
    /// Only for texts that are shorter than 4 GiB.
    YAMLScalar* Intern(std::string_view text, std::uint32_t hash, std::uint32_t line);

    /// Makes room for that many scalars in all.
    void Reserve(std::size_t count);

private:
    static constexpr std::size_t kMostProbes = 128; // of texts at hand not one in 1,000 goes further
    static constexpr std::size_t kMostAlike = 8;    // seldom more than one: a tag has 16 bits
    static constexpr unsigned kShardBits = 6;

    /// Scalar hashes enter container hashes, which decide what counts as equal: the seed is part of the
    /// system.
    static constexpr std::uint32_t kScalarSeed = 42;

    /// A scalar's address with 16 bits of its hash above it, so that most probes of other scalars need not
    /// look into memory elsewhere. User addresses have 47 bits on the platforms served.
    ///
    ///     hash 5b07e391    010110 11000001111110001110010001    shard 22, and where the walk begins in its
    ///     slots
    ///                                       1110001110010001    tag e391, above the address:
    ///
    ///         first slot     4c20 7f3a5c10f0c0    another tag: passed without a look at the scalar
    ///         second slot    e391 7f3a5c102018    this tag: the scalar's hash and text decide
    ///         third slot     0000 000000000000    empty: the text isn't known
    using Slot = std::atomic<std::uint64_t>;

    struct Slots {
        std::size_t capacity;
        Slot* entries; // kMostProbes more than the capacity, so that no walk goes round

        static std::size_t BytesFor(std::size_t capacity) { return (capacity + kMostProbes) * sizeof(Slot); }
        /// Where the walk for a hash begins: its bits behind those of the shard, as a part of the capacity.
        Slot* SlotOf(std::uint32_t hash) const {
            return &entries[std::uint64_t{hash << kShardBits} * capacity >> 32];
        }
    };

    struct TextHash : SeededHash {
        using SeededHash::operator();
        std::size_t operator()(const YAMLScalar* scalar) const { return (*this)(scalar->Value()); }
    };
    struct SameText {
        using is_transparent = void;
        bool operator()(const YAMLScalar* a, const YAMLScalar* b) const { return a == b; }
        bool operator()(std::string_view text, const YAMLScalar* scalar) const {
            return text == scalar->Value();
        }
    };
    using Overflow = std::unordered_set<YAMLScalar*, TextHash, SameText>;

    struct alignas(64) Shard {
        std::atomic<const Slots*> slots{nullptr};
        SpinLock lock;                // held for a few instructions, or seldom for those of Grow
        std::size_t count = 0;        // in slots
        Overflow* overflow = nullptr; // comes with the first slots, and stays until the process ends
    };

    static constexpr std::size_t kFirstCapacity = 64;

    Shard& ShardOf(std::uint32_t hash) { return m_Shards[hash >> (32 - kShardBits)]; }
    const Slot* SlotOf(std::uint32_t hash) const;
    /// What stands where a text belongs: its scalar, or the empty slot that it would take, or neither: it
    /// belongs into the overflow.
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
    static YAMLScalar* InternInOverflow(Shard& shard, const NewScalar& wanted);
    static Place Find(const Slots& slots, std::string_view text, std::uint32_t hash);
    static YAMLScalar* Make(const NewScalar& wanted);
    /// Gives the shard, whose lock is held, an empty table in `memory`, which stays until the process ends,
    /// and places all its scalars anew.
    static void Grow(Shard& shard, std::size_t capacity, void* memory);

    static ScalarTable s_Instance;

    SpinLock m_ReserveLock;
    std::array<Shard, std::size_t{1} << kShardBits> m_Shards;
};

} // namespace ovrin_yaml
