#include "Values/SeededHash.h"

#include <bit>
#include <cstring>
#include <random>

namespace ovrin_yaml {

namespace {

struct SipState {
    std::uint64_t v0, v1, v2, v3;

    void Round() {
        v0 += v1;
        v1 = std::rotl(v1, 13) ^ v0;
        v0 = std::rotl(v0, 32);
        v2 += v3;
        v3 = std::rotl(v3, 16) ^ v2;
        v0 += v3;
        v3 = std::rotl(v3, 21) ^ v0;
        v2 += v1;
        v1 = std::rotl(v1, 17) ^ v2;
        v2 = std::rotl(v2, 32);
    }

    void Take(std::uint64_t block) {
        v3 ^= block;
        Round();
        v0 ^= block;
    }
};

std::array<std::uint64_t, 2> RandomKey() {
    std::random_device device;
    std::array<std::uint64_t, 2> key;
    for (std::uint64_t& word : key) word = std::uint64_t{device()} << 32 | device();
    return key;
}

} // namespace

std::uint64_t SipHash13(std::string_view text, std::array<std::uint64_t, 2> key) {
    static_assert(std::endian::native == std::endian::little);
    SipState state{key[0] ^ 0x736f6d6570736575u, key[1] ^ 0x646f72616e646f6du, key[0] ^ 0x6c7967656e657261u,
                   key[1] ^ 0x7465646279746573u};
    std::uint64_t block;
    std::string_view rest = text;
    for (; rest.size() >= sizeof block; rest.remove_prefix(sizeof block)) {
        std::memcpy(&block, rest.data(), sizeof block);
        state.Take(block);
    }
    block = 0;
    if (!rest.empty()) std::memcpy(&block, rest.data(), rest.size());
    state.Take(block | std::uint64_t{text.size()} << 56);
    state.v2 ^= 0xff;
    for (int i = 0; i < 3; ++i) state.Round();
    return state.v0 ^ state.v1 ^ state.v2 ^ state.v3;
}

std::size_t SeededHash::operator()(std::string_view text) const {
    static const std::array<std::uint64_t, 2> key = RandomKey();
    return SipHash13(text, key);
}

} // namespace ovrin_yaml
