#include "Conflicts/OpenMerges.h"

#include "ErrorOf.h"
#include "Support/Program.h"
#include "Systems/ChildProcess.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>
#include <unistd.h>

namespace {

using namespace ovrin;

struct OpenMergesTest : testing::Test {
    OpenMerge Added(const std::string& path) {
        OpenMerge merge;
        merge.path = path;
        merge.occasion = {"merge", "", "main", "topic\xff", "1234"};
        merge.conflicts = 3;
        merge.texts = {"base\n", std::string("ours\0\n", 6), "theirs"};
        merges().Add(merge);
        return merge;
    }
    OpenMerges merges() const { return OpenMerges({SystemKind::Git, "", data}); }

    const program::WorkingDirectory folder;
    const std::string data = folder.Path();
};

TEST_F(OpenMergesTest, KeepsEveryByteOfAMerge) {
    const OpenMerge added = Added("odd \n\"name\"\xfe.ovrin");
    const std::optional<OpenMerge> found = merges().Find(added.path);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->texts.ours, added.texts.ours);
    EXPECT_EQ(found->texts.theirs, "theirs");
    EXPECT_EQ(found->occasion.ours, "main");
    EXPECT_EQ(found->conflicts, 3);
    EXPECT_FALSE(merges().Find("another.ovrin"));
}

TEST_F(OpenMergesTest, AreListedByPathAndForgotten) {
    Added("b.ovrin");
    Added("a.ovrin");
    EXPECT_EQ(merges().List().at(0).path, "a.ovrin");
    EXPECT_EQ(merges().List().at(1).path, "b.ovrin");
    merges().Remove("a.ovrin");
    merges().Remove("b.ovrin");
    merges().Remove("never there");
    EXPECT_TRUE(merges().List().empty());
    EXPECT_FALSE(std::filesystem::exists(data + "/ovrin"));
}

TEST_F(OpenMergesTest, DecisionsBelongToTheirMergeAlone) {
    OpenMerge first = Added("a.ovrin");
    merges().SetProgress(first, {}, {{{"1.Thing.x", Side::Theirs}}, 2, {{1, 7}}});
    EXPECT_EQ(merges().ProgressOf(first).decisions.at(0).side, Side::Theirs);
    EXPECT_EQ(merges().ProgressOf(first).open, 2);
    EXPECT_EQ(merges().ProgressOf(first).steps.at(0).number, 7);
    const OpenMerge second = Added("a.ovrin");
    EXPECT_TRUE(merges().ProgressOf(second).decisions.empty());
    EXPECT_EQ(merges().ProgressOf(second).open, 3);
}

TEST_F(OpenMergesTest, SecondOfTwoWhoDecideIsRefused) {
    OpenMerge merge = Added("a.ovrin"), unwritten = merge;
    unwritten.identity.clear();
    const Progress first{{{"1.Thing.x", Side::Theirs}}, 2, {{1, 1}}};
    merges().SetProgress(merge, {}, first);
    EXPECT_THROW(merges().SetProgress(merge, {}, {{{"1.Thing.y", Side::Ours}}, 2, {{1, 1}}}), Failure);
    EXPECT_THROW(merges().SetProgress(unwritten, {}, {}), Failure);
    EXPECT_EQ(merges().ProgressOf(merge).decisions, first.decisions);
    Added("a.ovrin"); // merged again
    EXPECT_THROW(merges().SetProgress(merge, first, first), Failure);
    merges().Remove("a.ovrin");
    EXPECT_THROW(merges().SetProgress(merge, first, first), Failure);
}

TEST_F(OpenMergesTest, WhatIsBrokenIsToldAndNotTakenForNothing) {
    Added("a.ovrin");
    for (const auto& entry : std::filesystem::directory_iterator(data + "/ovrin"))
        std::filesystem::resize_file(entry.path(), 60);
    EXPECT_THROW(merges().List(), Failure);
    EXPECT_THROW(merges().Find("a.ovrin"), Failure);
    Added("a.ovrin"); // the scene is merged again
    EXPECT_EQ(merges().List().at(0).path, "a.ovrin");
}

/// The one file of that extension.
std::filesystem::path OnlyFile(const std::string& data, const std::string& extension) {
    for (const auto& entry : std::filesystem::directory_iterator(data + "/ovrin"))
        if (entry.path().extension() == extension) return entry.path();
    return {};
}

void Put(const std::filesystem::path& file, const std::string& bytes) {
    std::ofstream(file, std::ios::binary) << bytes;
}

TEST_F(OpenMergesTest, CutOffRecordIsNeverTakenForAMerge) {
    const OpenMerge added = Added("a.ovrin");
    const std::filesystem::path file = OnlyFile(data, ".merge");
    const std::string whole = program::ReadFile(file);
    for (std::size_t length = 0; length < whole.size(); ++length) {
        Put(file, whole.substr(0, length));
        EXPECT_THROW(merges().Find("a.ovrin"), Failure) << length;
    }
    Put(file, whole);
    EXPECT_EQ(merges().Find("a.ovrin")->identity, added.identity);
}

TEST_F(OpenMergesTest, ChangedRecordIsAMergeOrAFailure) {
    Added("a.ovrin");
    const std::filesystem::path file = OnlyFile(data, ".merge");
    const std::string whole = program::ReadFile(file);
    for (std::size_t at = 0; at < whole.find('\n'); at += 2)
        for (const char other : {'9', '"', '\xff'}) {
            std::string changed = whole;
            changed[at] = other;
            Put(file, changed);
            try {
                merges().List();
                merges().Find("a.ovrin");
            } catch (const Failure& failure) {
                EXPECT_NE(std::string(failure.what()).find("Remove that file"), std::string::npos);
            }
        }
}

TEST_F(OpenMergesTest, ProgressThatCantBeReadIsToldWithItsCure) {
    OpenMerge merge = Added("a.ovrin");
    merges().SetProgress(merge, {}, {{{"1.Thing.x", Side::Theirs}, {"1.Thing.y", Side::Ours}}, 1, {{2, 7}}});
    const std::filesystem::path file = OnlyFile(data, ".progress");
    const std::string whole = program::ReadFile(file);
    const auto without = [&](const std::string& what, const std::string& with) {
        std::string changed = whole;
        Put(file, changed.replace(changed.find(what), what.size(), with));
        return failures::ErrorOf<Failure>([&] { merges().ProgressOf(merge); });
    };
    for (const auto& [what, with] : {std::pair{"\"open\"", "\"shut\""},
                                     {"theirs", "left"},
                                     {"\"decisions\":2", "\"decisions\":1"},
                                     {"}", ""},
                                     {":1", ":-"}}) {
        const std::string failure = without(what, with);
        EXPECT_TRUE(failure.starts_with("Cannot read the decisions in " + file.string()))
            << what << ": " << failure;
        EXPECT_TRUE(failure.ends_with("Remove that file to decide anew"));
    }
    Put(file, whole);
    EXPECT_EQ(merges().ProgressOf(merge).steps.at(0).number, 7u);
}

TEST_F(OpenMergesTest, PathThatFindsItsPlaceTakenGetsAnother) {
    Added("a.ovrin");
    const std::filesystem::path ofA = OnlyFile(data, ".merge");
    merges().Remove("a.ovrin");
    Added("b.ovrin");
    std::filesystem::rename(OnlyFile(data, ".merge"), ofA); // as if both had one number
    EXPECT_FALSE(merges().Has("a.ovrin"));
    Added("a.ovrin");
    EXPECT_EQ(merges().Find("a.ovrin")->path, "a.ovrin");
    EXPECT_EQ(merges().List().size(), 2u);
    std::filesystem::remove(ofA); // as b.ovrin's end does
    EXPECT_EQ(merges().Find("a.ovrin")->path, "a.ovrin");
}

/// Two processes each write and remove scenes of their own, and read the list all the time.
TEST_F(OpenMergesTest, ProcessesDontDisturbEachOther) {
    std::vector<pid_t> children;
    for (const char* name : {"a", "b"}) {
        children.push_back(fork());
        if (children.back() != 0) continue;
        try {
            for (int i = 0; i < 60; ++i) {
                const std::string path = name + std::to_string(i % 5);
                Added(path);
                if (!merges().Find(path)) _exit(2);
                if (i % 5 == 4 && i < 55) merges().Remove(path);
            }
        } catch (const std::exception&) {
            _exit(3);
        }
        _exit(0);
    }
    for (const pid_t child : children) EXPECT_EQ(WaitForProcess(child), 0);
    EXPECT_EQ(merges().List().size(), 10u);
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(data + "/ovrin"), {}), 10);
}

} // namespace
