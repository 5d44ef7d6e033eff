#include "Reading/OwnText.h"

#include <gtest/gtest.h>

#include <string>

namespace {

using namespace ovrin_yaml;

constexpr std::size_t kPiece = 1000;

/// The first `count` pieces of a file, of `fileSize` bytes as far as is known, are its own.
OwnText OwnAtFirst(std::size_t count, std::size_t fileSize) {
    OwnText own(fileSize);
    for (std::size_t i = 0; i < count; ++i) own.Append(std::string(kPiece, 'x'), i * kPiece);
    return own;
}

TEST(OwnTexts, KeepLittleMoreRoomThanTheyTake) {
    const std::string text = OwnAtFirst(3000, 100'000'000).Take();
    EXPECT_EQ(text, std::string(3000 * kPiece, 'x'));
    EXPECT_LE(text.capacity(), 2 * text.size());
}

TEST(OwnTexts, NeedNoRoomForAllOfTheFile) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "to sanitizers so much memory is an error";
#endif
    for (const std::size_t fileSize : {std::size_t{1} << 62, std::size_t{1} << 63})
        EXPECT_EQ(OwnAtFirst(3000, fileSize).Take().size(), 3000 * kPiece);
}

} // namespace
