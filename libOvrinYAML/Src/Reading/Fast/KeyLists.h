#pragma once

#include "Values/YAMLScalar.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <span>

namespace ovrin_yaml {

/// Remembers lists of keys that were met lately: there are millions of {x, y, z}, and one list is enough for
/// them all. Of two lists with one place the later one stays. Belongs to one thread; the lists themselves
/// belong to nobody, never change and stay until the process ends.
class KeyLists {
public:
    using List = const YAMLScalar* const*;

    struct Known {
        List list = nullptr;
        std::size_t count = SIZE_MAX;
        std::uint64_t note = 0;
    };

    /// The list of keyAt(0), ..., keyAt(count - 1). Null if a key is there twice.
    template <class KeyAt> List Get(std::size_t count, const KeyAt& keyAt) {
        const Known* known = Get(count, keyAt, [](List) { return std::uint64_t{0}; });
        return known ? known->list : nullptr;
    }
    /// The same, with what note(list) said of it when it was new. Valid until the next call.
    template <class KeyAt, class Note>
    const Known* Get(std::size_t count, const KeyAt& keyAt, const Note& note) {
        Known& known = m_Known[PlaceOf(count, keyAt)];
        if (known.count == count) {
            bool isSame = true;
            for (std::size_t i = 0; i < count; ++i) isSame &= known.list[i] == keyAt(i);
            if (isSame) return &known;
        }
        const YAMLScalar** list = Allocate(count);
        for (std::size_t i = 0; i < count; ++i) list[i] = keyAt(i);
        if (HasRepeatedKey({list, count})) return nullptr;
        known = {list, count, note(list)};
        return &known;
    }

private:
    static constexpr unsigned kPlaceBits = 8;

    /// Three keys tell most lists from each other.
    template <class KeyAt> static std::size_t PlaceOf(std::size_t count, const KeyAt& keyAt) {
        if (count == 0) return 0;
        const std::size_t hash =
            keyAt(0)->m_Hash + 3 * keyAt(count / 2)->m_Hash + 5 * keyAt(count - 1)->m_Hash;
        return (hash + count) * 0x9e3779b97f4a7c15u >> (64 - kPlaceBits);
    }
    static const YAMLScalar** Allocate(std::size_t count);
    static bool HasRepeatedKey(std::span<const YAMLScalar* const> keys);

    std::array<Known, std::size_t{1} << kPlaceBits> m_Known;
};

} // namespace ovrin_yaml
