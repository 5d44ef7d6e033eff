#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace ovrin_yaml {

/// A text of at most kLongest bytes as two words, the first byte lowest, with zeros behind it.
struct ShortText {
    static constexpr std::size_t kLongest = 16;

    std::uint64_t low = 0;
    std::uint64_t high = 0;
    std::uint64_t length = 0;

    /// kLongest bytes from the text's start on must be readable.
    static ShortText Pack(std::string_view text) {
        ShortText packed;
        packed.length = text.size();
        std::memcpy(&packed.low, text.data(), 8);
        std::memcpy(&packed.high, text.data() + 8, 8);
        packed.low &= kMasks[text.size()].low;
        packed.high &= kMasks[text.size()].high;
        return packed;
    }

private:
    struct Mask {
        std::uint64_t low, high;
    };
    /// The lowest bytes of a pair of words, by their number.
    static constexpr std::array<Mask, kLongest + 1> kMasks = [] {
        const auto lowest = [](std::size_t bytes) {
            return bytes >= 8 ? ~std::uint64_t{0} : (std::uint64_t{1} << 8 * bytes) - 1;
        };
        std::array<Mask, kLongest + 1> masks{};
        for (std::size_t i = 0; i <= kLongest; ++i) masks[i] = {lowest(i), i > 8 ? lowest(i - 8) : 0};
        return masks;
    }();
};

} // namespace ovrin_yaml
