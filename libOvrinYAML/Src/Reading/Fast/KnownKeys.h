#pragma once

#include "Reading/Fast/FlowShape.h"
#include "Values/YAMLScalar.h"

#include <array>
#include <cstdint>
#include <cstring>
#include <deque>
#include <memory>

namespace ovrin_yaml {

struct KnownKey;

/// The two keys that were met last in a place, the later one first.
struct KeyGuess {
    KnownKey* latest;
    KnownKey* earlier;

    void Take(KnownKey& key) {
        if (latest == &key) return;
        earlier = latest;
        latest = &key;
    }
};

/// A key that was met before in mappings under a certain parent.
struct KnownKey {
    explicit KnownKey(std::uint32_t number) : number(number) {}

    const std::uint32_t number; ///< among those that are known
    YAMLScalar* scalar = nullptr;
    /// The first eight bytes of the text and the colon behind it, and which of their bits count. Without a
    /// key there is nothing that they could be.
    std::uint64_t word = 1;
    std::uint64_t wordMask = 0;
    std::uint32_t length = 0; // of the text
    std::uint32_t hash = 0;
    std::uint32_t parent = 0; // its number
    /// For the key behind this one and for the first key of a mapping that is its value.
    KeyGuess next{};
    KeyGuess inside{};
    /// Of flow mappings that are its value or items of that; null if none was met.
    std::unique_ptr<FlowShapes> shapes{};

    /// Whether the key stands at `position` with a colon behind it. The bytes up to kLongest + 1 behind it
    /// must be readable.
    bool StandsAt(const char* position) const {
        if ((Load(position) & wordMask) != word) return false;
        if (length < 8) return true;
        const char* text = scalar->Value().data();
        for (std::uint32_t i = 8; i + 8 < length; i += 8)
            if (Load(position + i) != Load(text + i)) return false;
        return position[length] == ':' && Load(position + length - 8) == Load(text + length - 8);
    }

    /// Becomes another key, with nothing known of what stands behind and inside.
    void Become(YAMLScalar* newScalar, std::uint32_t newParent);

    /// The length of the longest key that is guessed.
    static constexpr std::size_t kLongest = 128;

    static std::uint64_t Load(const char* from) {
        std::uint64_t word;
        std::memcpy(&word, from, sizeof word);
        return word;
    }
};

/// Guesses keys: objects of one class have the same keys in the same order, so that the key behind another is
/// nearly always the one that stood there last time. A guess is tested with a few comparisons of words, where
/// reading a key means looking at every character, hashing and searching.
///
///     Transform -inside-> m_GameObject -next-> m_LocalPosition -next-> m_LocalScale ...
///                              |inside              |inside
///                            fileID                 x -next-> y -next-> z
///
/// A key that was left out or put in, because some are optional, is found one or two guesses later. Places
/// are few: of too many keys the latest stay. A guess may be wrong, never harmful.
class KnownKeys {
public:
    KnownKeys() {
        m_Unknown.next = m_Unknown.inside = m_Root.next = m_Root.inside = {&m_Unknown, &m_Unknown};
    }
    KnownKeys(const KnownKeys&) = delete;
    KnownKeys& operator=(const KnownKeys&) = delete;

    /// What stands in front of a document's first key.
    KnownKey& Root() { return m_Root; }

    /// The key that stands at `position`, or null if it isn't one of those guessed.
    static KnownKey* Find(KeyGuess& guess, const char* position) {
        if (guess.latest->StandsAt(position)) return guess.latest;
        return FindOther(guess, position);
    }

    /// The place of a key under `parent`, which `guess` takes for the next time.
    KnownKey& Learn(const KnownKey& parent, YAMLScalar* scalar, KeyGuess& guess);
    /// The place of a key that must not be guessed.
    KnownKey& Unknown() { return m_Unknown; }

private:
    static constexpr unsigned kPlaceBits = 10;
    static constexpr std::size_t kProbes = 4;

    static KnownKey* FindOther(KeyGuess& guess, const char* position);
    std::uint16_t& PlaceOf(const KnownKey& parent, const YAMLScalar* scalar);

    KnownKey m_Root{0};
    KnownKey m_Unknown{UINT32_MAX};
    std::deque<KnownKey> m_Keys; // by number, from 1 on
    /// The numbers of keys, each in the place that its text and its parent give; 0: none.
    std::array<std::uint16_t, (std::size_t{1} << kPlaceBits) + kProbes> m_Places{};
};

} // namespace ovrin_yaml
