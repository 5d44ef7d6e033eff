#include "Values/Hash.h"

#include <bit>
#include <cstring>

namespace ovrin_yaml {

namespace {

constexpr std::uint32_t kFactor1 = 0xcc9e2d51u;
constexpr std::uint32_t kFactor2 = 0x1b873593u;

std::uint32_t Scramble(std::uint32_t block) {
    return std::rotl(block * kFactor1, 15) * kFactor2;
}

std::uint32_t FoldBlock(std::uint32_t hash, std::uint32_t block) {
    return std::rotl(hash ^ Scramble(block), 13) * 5 + 0xe6546b64u;
}

std::uint32_t Finalise(std::uint32_t hash) {
    hash = (hash ^ (hash >> 16)) * 0x85ebca6bu;
    hash = (hash ^ (hash >> 13)) * 0xc2b2ae35u;
    return hash ^ (hash >> 16);
}

} // namespace

std::uint32_t MurmurHash3(std::string_view text, std::uint32_t seed) {
    static_assert(std::endian::native == std::endian::little);
    const char* bytes = text.data();
    const std::size_t blocks = text.size() / 4;
    std::uint32_t hash = seed;
    for (std::size_t i = 0; i < blocks; ++i) {
        std::uint32_t block;
        std::memcpy(&block, bytes + 4 * i, 4);
        hash = FoldBlock(hash, block);
    }
    std::uint32_t tail = 0;
    for (std::size_t i = text.size(); i > 4 * blocks; --i)
        tail = tail << 8 | static_cast<unsigned char>(bytes[i - 1]);
    if (text.size() % 4) hash ^= Scramble(tail);
    return Finalise(hash ^ static_cast<std::uint32_t>(text.size()));
}

std::uint32_t MurmurHash3(std::uint64_t low, std::uint64_t high, std::size_t length, std::uint32_t seed) {
    const std::uint32_t blocks[] = {static_cast<std::uint32_t>(low), static_cast<std::uint32_t>(low >> 32),
                                    static_cast<std::uint32_t>(high), static_cast<std::uint32_t>(high >> 32),
                                    0};
    // The length is hard to foretell, so that all blocks are cheaper than the right number of them. A rest of
    // nothing is zero, which changes nothing.
    std::uint32_t hashes[5] = {seed};
    for (std::size_t i = 0; i < 4; ++i) hashes[i + 1] = FoldBlock(hashes[i], blocks[i]);
    const std::uint32_t hash = hashes[length / 4] ^ Scramble(blocks[length / 4]);
    return Finalise(hash ^ static_cast<std::uint32_t>(length));
}

} // namespace ovrin_yaml
