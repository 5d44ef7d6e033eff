#pragma once

#include "Values/YAMLScalar.h"

#include <bit>
#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace ovrin_yaml {

/// Tells of most texts that they aren't among some ids, without a look into the table of all scalars: a Bloom
/// filter with one hash function. Whoever fills it with texts of one hash only makes it useless.
class IDFilter {
public:
    /// `ids` is a container of pointers to scalars.
    template <class IDs>
    explicit IDFilter(const IDs& ids) : m_Bits(std::bit_ceil(ids.size() * kBitsPerID / 64 + 1)) {
        for (const YAMLScalar* id : ids) {
            const std::uint64_t hash = HashOf(id->Value());
            m_Bits[WordOf(hash)] |= std::uint64_t{1} << hash % 64;
        }
    }

    bool MayContain(std::string_view id) const {
        const std::uint64_t hash = HashOf(id);
        return m_Bits[WordOf(hash)] >> hash % 64 & 1;
    }

private:
    static constexpr std::size_t kBitsPerID = 16;

    static std::uint64_t HashOf(std::string_view id) {
        std::uint64_t hash = id.size();
        for (const char c : id) hash = hash * 31 + static_cast<unsigned char>(c);
        return hash * 0x9e3779b97f4a7c15u >> 16;
    }
    std::size_t WordOf(std::uint64_t hash) const { return hash / 64 & (m_Bits.size() - 1); }

    std::vector<std::uint64_t> m_Bits;
};

} // namespace ovrin_yaml
