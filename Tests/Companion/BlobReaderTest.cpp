#include "Systems/BlobReader.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;

struct BlobReaderTest : GitFolder {
    static std::string Add(const std::string& bytes) {
        return OutputOf({"git", "hash-object", "-w", "--stdin"}, {.input = bytes}).substr(0, 40);
    }
};

TEST_F(BlobReaderTest, BlobsComeOneAfterTheOther) {
    const std::string big(std::size_t{3} << 20, '\n');
    const std::string ids[] = {Add(big), Add(""), Add("one\n"), Add(std::string("a\0b", 3))};
    BlobReader reader({});
    EXPECT_EQ(reader.Read(ids[0]), big);
    EXPECT_EQ(reader.Read(ids[1]) + reader.Read(ids[2]), "one\n");
    EXPECT_EQ(reader.ReadIf(ids[0], [&](std::string_view text) { return text.size() < 4096; }), std::nullopt);
    EXPECT_EQ(reader.Read(ids[3]), std::string("a\0b", 3));
}

/// Sizes around those at which the buffer and the beginning end.
TEST_F(BlobReaderTest, EverySizeIsReadWholeOrNotAtAll) {
    BlobReader reader({});
    for (const std::size_t size : {0, 1, 4095, 4096, 4097, 65535, 65536, 65537, 131072}) {
        const std::string bytes(size, 'x'), id = Add(bytes);
        std::size_t seen = 0;
        const auto look = [&](bool isWanted) {
            return reader.ReadIf(id, [&](std::string_view beginning) {
                seen = beginning.size();
                return isWanted;
            });
        };
        EXPECT_EQ(look(false), std::nullopt);
        EXPECT_TRUE(look(true) == bytes) << size;
        EXPECT_EQ(seen, std::min(size, BlobReader::kBeginning));
    }
}

TEST_F(BlobReaderTest, WhatIsNoBlobIsAFailureAndTheNextOneFollows) {
    const std::string id = Add("one"), commit = Commit({{"a", "1"}});
    BlobReader reader({});
    for (const std::string& none :
         {std::string(40, 'a'), std::string("HEAD:a\nb"), std::string(), commit, std::string("HEAD")})
        EXPECT_THROW(reader.Read(none), Failure) << none;
    EXPECT_EQ(reader.Read(id), "one");
}

/// A git that says anything to the first request.
std::string FailureOn(const std::string& answer) {
    surroundings::FakePrograms programs;
    programs.Say("git", "--batch", answer);
    return ErrorOf<Failure>([] { BlobReader({}).Read("abc"); });
}

TEST(BlobReaderAnswer, ThatIsNoBlobIsToldAsItIs) {
    EXPECT_EQ(FailureOn("abc blob 2\nxy\n"), "none");
    for (const char* line : {"abc missing", "abd blob 1", "abc blob ", "abc blob x", "abc blob -1",
                             "abc blob 1x", "abc blob 99999999999999999999", "abc tree 3", "abd tree 3", ""})
        EXPECT_EQ(FailureOn(std::string(line) + "\nxyz\n"),
                  "git has no blob abc, it says \"" + std::string(line) + "\"");
}

TEST(BlobReaderAnswer, ThatEndsTooSoonIsAFailure) {
    for (const char* answer :
         {"", "abc", "abc blob 3", "abc blob 3\n", "abc blob 3\nxy", "abc blob 3\nxyz"}) {
        const std::string failure = FailureOn(answer);
        EXPECT_TRUE(failure.starts_with("git ended")) << answer << ": " << failure;
    }
}

} // namespace
