#include "Systems/BlobReader.h"

#include "Support/Program.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;

class BlobReaderTest : public testing::Test {
protected:
    BlobReaderTest() { OutputOf({"git", "init", "-q"}, m_Setting); }

    std::string Add(const std::string& bytes) {
        ProcessSetting setting = m_Setting;
        setting.input = bytes;
        return OutputOf({"git", "hash-object", "-w", "--stdin"}, setting).substr(0, 40);
    }

    const program::WorkingDirectory m_Directory;
    const ProcessSetting m_Setting{.folder = m_Directory.Path().string()};
};

TEST_F(BlobReaderTest, BlobsComeOneAfterTheOther) {
    const std::string big(std::size_t{3} << 20, '\n');
    const std::string ids[] = {Add(big), Add(""), Add("one\n"), Add(std::string("a\0b", 3))};
    BlobReader reader(m_Setting);
    EXPECT_EQ(reader.Read(ids[0]), big);
    EXPECT_EQ(reader.Read(ids[1]) + reader.Read(ids[2]), "one\n");
    EXPECT_EQ(reader.ReadIf(ids[0], [&](std::string_view text) { return text.size() < 4096; }), std::nullopt);
    EXPECT_EQ(reader.Read(ids[3]), std::string("a\0b", 3));
}

TEST_F(BlobReaderTest, WhatIsNoBlobIsAFailureAndTheNextOneFollows) {
    const std::string id = Add("one");
    BlobReader reader(m_Setting);
    EXPECT_THROW(reader.Read(std::string(40, 'a')), Failure);
    EXPECT_THROW(reader.Read("HEAD:a\nb"), Failure);
    EXPECT_EQ(reader.Read(id), "one");
}

} // namespace
