#include "Values/ScalarTable.h"
#include "Values/SeededHash.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <bit>
#include <cstring>
#include <set>
#include <thread>

namespace {

using namespace ovrin_yaml;

/// What undoes the multiplication by an odd number.
constexpr std::uint32_t Inverse(std::uint32_t factor) {
    std::uint32_t inverse = factor;
    for (int i = 0; i < 5; ++i) inverse *= 2 - factor * inverse;
    return inverse;
}

/// A text with the given hash of scalars, another one for each number: MurmurHash3 can be undone, block by
/// block.
std::string TextOfHash(std::uint32_t hash, std::uint32_t number) {
    hash = (hash ^ hash >> 16) * Inverse(0xc2b2ae35u);
    hash = (hash ^ hash >> 13 ^ hash >> 26) * Inverse(0x85ebca6bu);
    const std::uint32_t wanted = hash ^ hash >> 16 ^ 8;
    const auto scramble = [](std::uint32_t block) {
        return std::rotl(block * 0xcc9e2d51u, 15) * 0x1b873593u;
    };
    const std::uint32_t first = std::rotl(42 ^ scramble(number), 13) * 5 + 0xe6546b64u;
    const std::uint32_t mixed = std::rotr((wanted - 0xe6546b64u) * Inverse(5), 13) ^ first;
    const std::uint32_t last = std::rotr(mixed * Inverse(0x1b873593u), 15) * Inverse(0xcc9e2d51u);
    std::string text(8, '\0');
    std::memcpy(text.data(), &number, 4);
    std::memcpy(text.data() + 4, &last, 4);
    return text;
}

TEST(ScalarTable, TextsOfOneHashAndOfOnePlaceAreFoundAgainByAllThreads) {
    std::vector<std::string> texts;
    for (std::uint32_t i = 0; i < 10'000; ++i) {
        texts.push_back(TextOfHash(0xabcd1234u, i));
        texts.push_back(TextOfHash(0xabcd0000u + i, ~i));
        texts.push_back(TextOfHash(0xa8000000u + i * 0x1234u, i)); // makes the shard grow meanwhile
    }
    ASSERT_EQ(ScalarTable::HashOf(texts[300]), 0xabcd1234u);
    std::vector<std::vector<const YAMLScalar*>> found(4, std::vector<const YAMLScalar*>(texts.size()));
    std::vector<std::thread> threads;
    for (std::size_t t = 0; t < found.size(); ++t)
        threads.emplace_back([&, t] {
            if (t % 2) ScalarTable::Instance().Reserve(texts.size() * t);
            for (std::size_t i = 0; i < texts.size(); ++i) {
                const std::size_t at = (i + t * texts.size() / 8) % texts.size();
                found[t][at] = YAMLScalar::Lookup(texts[at]);
            }
        });
    for (std::thread& thread : threads) thread.join();
    for (std::size_t i = 0; i < texts.size(); ++i) ASSERT_EQ(found[0][i]->Value(), texts[i]);
    EXPECT_EQ(std::count(found.begin(), found.end(), found[0]), 4) << "one object for each text";
    EXPECT_EQ(std::set(found[0].begin(), found[0].end()).size(), texts.size());
}

TEST(ScalarTable, SipHashIsTheOneThatIsPublished) {
    const std::array<std::uint64_t, 2> key{0x0706050403020100u, 0x0f0e0d0c0b0a0908u};
    EXPECT_EQ(SipHash13("", key), 0xabac0158050fc4dcu);
    EXPECT_EQ(SipHash13(std::string_view("\0", 1), key), 0xc9f49bf37d57ca93u);
    EXPECT_NE(SeededHash()("12345678a"), SeededHash()("12345678b"));
}

} // namespace
