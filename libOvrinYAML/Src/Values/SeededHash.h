#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// SipHash-1-3 by Jean-Philippe Aumasson and Daniel J. Bernstein: nobody who doesn't know the key finds texts
/// of one hash.
std::uint64_t SipHash13(std::string_view text, std::array<std::uint64_t, 2> key);

/// The hash for tables whose keys come out of files: under a key that each process chooses anew, so that no
/// file can be made to fill one bucket. For look-ups of single keys only: no order may come out of it.
struct SeededHash {
    using is_transparent = void;

    std::size_t operator()(std::string_view text) const;
};

} // namespace ovrin_yaml
