#include "Repair/YAMLTypeInfo.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

#include <stdexcept>

using namespace object_text;

namespace {

std::string Entry(const std::string& id, const std::string& name, const std::string& isMulti,
                  const std::string& required = "''") {
    return "{id: " + id + ", name: " + name + ", ismulti: " + isMulti + ", baseid: 2, requires: " + required +
           ", conflicts: ''}";
}

void Read(YAMLTypeInfoManager& manager, const std::string& list) {
    manager.Read(Scene("1 &1 MergeTypeInfo: " + list).Objects());
}

TEST(YAMLTypeInfo, CompactSetsAreLittleEndianHexadecimal) {
    const std::pair<const char*, std::set<int>> kCases[] = {
        {"", {}},
        {"72000000", {114}},
        {"f4010000F4010000", {500}},
        {"010000000200", {1}},
        {"ffffffff01000000", {-1, 1}},
        {"0000000", {}},
        {"/:@[`g00", {0xa094f3}},
    };
    for (const auto& [text, numbers] : kCases) {
        std::set<int> read;
        ReadCompactSerializedSet(text, read);
        EXPECT_EQ(read, numbers) << text;
    }
}

TEST(YAMLTypeInfo, EntryIsFoundByTheIdOfItsClass) {
    YAMLTypeInfoManager manager;
    EXPECT_EQ(manager.GetTypeInfo(Id("500")), nullptr);
    Read(manager, "[" + Entry("500", "A", "1", "0a00000009000000") + ", " + Entry("500", "B", "0") + ", " +
                      Entry("x", "C", "2") + "]");
    const YAMLTypeInfo* type = manager.GetTypeInfo(Id("500"));
    EXPECT_EQ(type->m_Name, Id("A"));
    EXPECT_EQ(type->m_BaseID, Id("2"));
    EXPECT_TRUE(type->m_IsMulti);
    EXPECT_EQ(type->m_Requires, (std::vector{Id("9"), Id("10")}));
    EXPECT_FALSE(manager.GetTypeInfo(Id("x"))->m_IsMulti);
}

TEST(YAMLTypeInfo, ReadingAgainReplacesWhatWasThere) {
    YAMLTypeInfoManager manager;
    Read(manager, "[" + Entry("1", "A", "0") + "]");
    Read(manager, "[]");
    EXPECT_TRUE(manager.IsLoaded());
    EXPECT_EQ(manager.GetTypeInfo(Id("1")), nullptr);
}

TEST(YAMLTypeInfo, BadFilesFail) {
    const std::string noList = "Cannot findMergeTypeInfo object in YAMLMapping provided\n";
    const std::pair<std::string, std::string> kCases[] = {
        {"1 &2 MergeTypeInfo: []", noList},
        {"1 &1 MergeTypeInfo: {}", noList},
        {"1 &1 MergeTypeInfo: [x]", "Cannot read id in YAMLTypeInfo file\n"},
        {"1 &1 MergeTypeInfo: [{id: 1, name: A, ismulti: 0}]", "Cannot read baseid in YAMLTypeInfo file\n"},
        {"1 &1 MergeTypeInfo: [" + Entry("1", "A", "0", "[]") + "]",
         "Cannot read requires in YAMLTypeInfo file\n"},
    };
    for (const auto& [file, failure] : kCases) {
        YAMLTypeInfoManager manager;
        EXPECT_EQ(ErrorOf<std::runtime_error>([&] { manager.Read(Scene(file).Objects()); }), failure);
    }
}

} // namespace
