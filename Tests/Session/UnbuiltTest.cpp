#include "Diff/YAMLMappingDiff.h"
#include "Repair/ObjectTraits.h"
#include "Repair/UnbuiltReferences.h"
#include "Session/MergeSession.h"
#include "Support/Documents.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <string>
#include <thread>

namespace {

using namespace documents;
using namespace std::string_literals;

/// Three files that have all of `shared` in common, around which each has what is its own.
struct UnbuiltTest : testing::Test {
    UnbuiltTest() { initialize(); }

    /// Reads them, with the trees of all objects where `recognise` is off.
    std::unique_ptr<MergeSession> Read(bool recognise = true, Threads threads = Threads::None) const {
        auto session = std::make_unique<MergeSession>(threads);
        ReaderOptions options = DefaultReaderOptions();
        options.recognise = recognise;
        session->Read({TextInput("base", ObjectText(shared + base)), Input("left", ObjectText(shared + left)),
                       Input("right", ObjectText(shared + right))},
                      nullptr, options);
        return session;
    }
    /// A file that is in memory, or comes in steps of so many bytes.
    InputFile Input(const std::string& name, const std::string& text) const {
        InputFile input = TextInput(name, text);
        if (step == 0) return input;
        input.open = [text, step = step]() -> ByteSource {
            return [text, step, at = std::size_t{0}](char* bytes, std::size_t size) mutable {
                const std::size_t count = std::min({step, size, text.size() - at});
                std::copy_n(text.data() + at, count, bytes);
                at += count;
                return count;
            };
        };
        return input;
    }
    /// The whole merge. "b" and "u" for each object of the result that is built or isn't, in file order,
    /// ahead of its text.
    std::string Merge(bool recognise = true) const {
        const auto session = Read(recognise);
        session->Prepare();
        session->Diff();
        session->Merge();
        session->Apply(MergeSession::Base::UsedUp);
        session->Repair();
        const std::string built = Built(session->Result().GetMapping());
        return built + "\n" + Written(session->Result());
    }
    static std::string Built(const YAMLMapping& root) {
        std::string built;
        for (const YAMLMapping::Entry entry : root) built += AsMapping(entry.value)->IsBuilt() ? 'b' : 'u';
        return built;
    }
    /// The merge is that of objects that are all built, and these objects had to be.
    void ExpectBuilt(const std::string& built) {
        const std::string expected = Merge(false);
        for (const std::size_t each : {0, 1, 5, 1000}) {
            step = each;
            const std::string merged = Merge();
            EXPECT_EQ(merged.substr(0, merged.find('\n')), built) << each;
            EXPECT_EQ(merged.substr(merged.find('\n')), expected.substr(expected.find('\n'))) << each;
        }
    }

    /// What goes wrong in a step, and where.
    template <class Step> static std::string Failure(const Step& step) {
        try {
            step();
        } catch (const MergeError& error) {
            return error.what() + ", " + error.Object() + ", " + std::to_string(error.Line());
        }
        return "none";
    }

    std::string shared, base, left, right;
    std::size_t step = 0;
};

std::string Transform(int id, int father) {
    return "--- !o!4 &" + std::to_string(id) +
           "\nTransform:\n  m_Father: {fileID: " + std::to_string(father) + "}\n";
}

TEST_F(UnbuiltTest, WhatNobodyTouchesIsNeverBuilt) {
    shared = Transform(1, 0) + "--- !o!1 &2\nGameObject:\n  m_Name: 'a: b'\n";
    base = "--- !o!1 &3\nGameObject:\n  m_Name: a\n";
    left = "--- !o!1 &3\nGameObject:\n  m_Name: b\n";
    right = base + "--- !o!1 &4\nGameObject:\n  m_Name: c\n";
    ExpectBuilt("uubb");
}

/// Long texts are broken behind the width, and what can't be seen is escaped.
TEST_F(UnbuiltTest, QuotedTextsMayStandAsTheyAreWritten) {
    const std::string words =
        "one two three four five six seven eight nine ten eleven twelve thirteen fourteen";
    for (const std::string& fields :
         {"  m_Text: 'a: " + words + "'\n", "  m_Text: \"\\t " + words + "  " + words + "\"\n",
          "  m_Text: 'it''s'\n"s, "  m_Text: \"\\tb\\x01\\u1234\"\n"s, "  m_Text: 'a: b\n\n    c'\n"s,
          "  m_List:\n  - 'a: " + words + "'\n", "  m_Link: {a: 1, b: 'a: " + words + "', c: \"\\t\"}\n"}) {
        const std::string written = ReadAndWrite(ObjectText("--- !o!1 &2\nGameObject:\n" + fields));
        shared = written.substr(written.find("---"));
        ExpectBuilt("u");
        // The text and what it means stay the same.
        const std::size_t fold = shared.find("\n    "), escape = shared.find("\\t");
        if (fold == std::string::npos && escape == std::string::npos) continue;
        if (fold != std::string::npos)
            shared.insert(fold + 1, " ");
        else
            shared.replace(escape, 2, "\\x09");
        ExpectBuilt("b");
    }
}

/// Mappings of one shape differ in what their texts tell of the object.
TEST_F(UnbuiltTest, TextsOfAShapeThatIsKnownCount) {
    const auto linked = [](int id, const std::string& link) {
        return "--- !o!1 &" + std::to_string(id) + "\nGameObject:\n  m_PrefabInternal: " + link + "\n";
    };
    int id = 10;
    for (const std::string link :
         {"{fileID: 0}", "{fileID: 0}", "{fileID: 9}", "{fileID: 0}", "{fileID: 0, a: 1}",
          "{fileID: 9, a: 1}", "{a: 9, b: 1}", "{a: 9, b: 1}", "{fileID: 0}", "{fileID: 9}"})
        shared += linked(id++, link);
    base = left = "--- !o!1001 &9\nPrefab:\n  a: 1\n";
    ExpectBuilt("uubuubuuub");
    for (const std::string odd : {"{fileID: 0, fileID: 9}", "{a: 1, a: 1}", "{fileID: '9'}",
                                  "{fileID: {a: 1}}", "{fileID: }", "{fileID: 1, b: 2", "{fileID: 12"}) {
        shared = linked(1, "{fileID: 0}") + linked(2, "{a: 1, b: 1}") + linked(3, "{fileID: 0, b: 1}") +
                 linked(4, odd);
        const auto outcome = [&](bool recognise) {
            std::string merged;
            const std::string failure = Failure([&] { merged = Merge(recognise); });
            return failure + merged.substr(std::min(merged.find('\n'), merged.size()));
        };
        EXPECT_EQ(outcome(true), outcome(false)) << odd;
    }
}

/// The base is searched near the place where something else was expected, and as a whole only if much isn't
/// there.
TEST_F(UnbuiltTest, DocumentsThatMovedFarAreFoundInTheEnd) {
    std::string front, back;
    for (int id = 1; id <= 400; ++id) (id <= 100 ? front : back) += Transform(id, 0);
    base = right = front + back;
    left = back + front;
    // left begins with the second part, of which 256 documents are only looked for nearby.
    ExpectBuilt(std::string(100, 'u') + std::string(256, 'b') + std::string(44, 'u'));
}

TEST_F(UnbuiltTest, ChildrenOfARemovedTransformAreFoundInTheirBytes) {
    shared = Transform(1, 9) + Transform(2, 90) + Transform(3, 0) +
             "--- !o!4 &4\nTransform:\n  m_Name: m_Father\n  m_Father: {fileID: 0}\n";
    base = right = Transform(9, 0);
    ExpectBuilt("buub");
}

TEST_F(UnbuiltTest, LinksToARemovedPrefabAreFoundInTheirBytes) {
    const auto linked = [](int id, const std::string& target) {
        return "--- !o!1 &" + std::to_string(id) +
               "\nGameObject:\n  a:\n  - m_PrefabInternal: {fileID: " + target + "}\n";
    };
    shared = linked(1, "9") + linked(2, "2") + linked(3, "0") + linked(4, "9, guid: a") +
             "--- !o!1001 &5\nPrefab:\n  a: 1\n";
    base = left = "--- !o!1001 &9\nPrefab:\n  a: 1\n";
    ExpectBuilt("buubu");
}

TEST_F(UnbuiltTest, AnIDThatMovedIsFollowedInTheBytes) {
    shared = "--- !o!1 &1\nGameObject:\n  a: {fileID: 90}\n--- !o!1 &2\nGameObject:\n  a: {fileID: 9}\n";
    left = Transform(9, 0);
    right = "--- !o!1 &9\nGameObject:\n  a: 1\n";
    ExpectBuilt("ubbb");
}

/// A Transform of a prefab instance, which has to name it.
TEST_F(UnbuiltTest, AStrippedTransformWithoutALinkIsAFailureStill) {
    const auto failure = [this](bool recognise) { return Failure([&] { Merge(recognise); }); };
    shared = "--- !o!4 &1 stripped\nTransform:\n  m_PrefabInstance: {fileID: 7}\n";
    EXPECT_EQ(failure(true), "none");
    shared += "--- !o!4 &2 stripped\nTransform:\n  m_Other: {fileID: 7}\n";
    EXPECT_NE(failure(false), "none");
    EXPECT_EQ(failure(true), failure(false));
}

/// Where most is shared only the rest of left and right is kept, and a failure needs the whole.
TEST_F(UnbuiltTest, FailuresHaveTheirPlaceInTheWholeFile) {
    const auto place = [this](bool recognise) { return Failure([&] { Read(recognise); }); };
    for (int id = 10; id < 60; ++id) shared += Transform(id, 0);
    left = "--- !o!1 &1\nA: 1\n--- !o!1 &2\nA: [\n" + Transform(3, 0);
    step = 100;
    EXPECT_TRUE(place(true).ends_with(", 2, 155")) << place(true);
    EXPECT_EQ(place(true), place(false));
    left = "--- !o!1 &1\n# only libyaml reads this\nA: 1\n" + Transform(3, 0);
    EXPECT_EQ(place(true), "none");
    EXPECT_EQ(Written(Read()->LeftObjects()), ObjectText(shared + "--- !o!1 &1\nA: 1\n" + Transform(3, 0)));
}

/// What comes in steps and isn't beside the base is read as any other file.
TEST_F(UnbuiltTest, FilesThatHaveNothingInCommonWithTheBaseAreReadWhole) {
    shared = Transform(1, 0);
    const auto readSide = [this](const std::string& file, std::size_t bytes) {
        step = bytes;
        MergeSession session(Threads::None);
        const std::string failure = ErrorOf([&] {
            session.Read({TextInput("base", ObjectText(shared)), Input("left", file), Input("right", file)});
        });
        return failure == "none" ? Written(session.RightObjects()) : failure;
    };
    std::string otherHeader = ObjectText(shared), later = ObjectText(shared + Transform(2, 0));
    otherHeader.replace(otherHeader.find("tag:"), 4, "tag:other.");
    for (const std::string& file :
         {otherHeader, std::string("no signature"), std::string(1, '\0') + later,
          std::string(5, '\0') + later, std::string(), ObjectText(""), later,
          later + '\0' + "--- !o!1 &3\nA: [\n", "\xEF\xBB\xBF" + later, ObjectText(shared).substr(0, 30)})
        for (const std::size_t bytes : {1, 10, 1000})
            EXPECT_EQ(readSide(file, bytes), readSide(file, 0)) << file;
}

/// Transitions are changed in every file, so none may be shared.
TEST_F(UnbuiltTest, WhatMayNotBeSharedIsReadOfTheBasesBytes) {
    for (int id = 10; id < 60; ++id) shared += Transform(id, 0);
    shared += "--- !o!1107 &1\nAnimatorStateMachine:\n  m_StateMachineTransitions:\n    first: {fileID: 1}\n";
    right = Transform(2, 0);
    ExpectBuilt(std::string(50, 'u') + "bb");
}

/// Its objects are others than the base's, which are compared with them.
TEST_F(UnbuiltTest, NothingIsUnbuiltBesideAFileOfAnotherHeader) {
    const std::string object = ObjectText("--- !o!1 &1\na: 1\nb: r27104\n");
    for (const std::string handle : {"!o!", "!x!"}) {
        // The hash is the same, and so nothing else is looked at.
        const std::string other =
            "%YAML 1.1\n%TAG " + handle + " tag:a,2011:\n--- " + handle + "1 &1\nk: w84188\n";
        MergeSession session(Threads::None);
        session.Read({TextInput("base", object), TextInput("left", other), TextInput("right", object)});
        EXPECT_EQ(Built(session.BaseObjects().GetMapping()), "b");
        session.Prepare();
        session.Diff();
        EXPECT_TRUE(session.LeftDiff().Entries().empty());
    }
}

TEST_F(UnbuiltTest, AnyNumberOfThreadsMayAskForAnObject) {
    for (int id = 1; id < 300; ++id) shared += Transform(id, id + 1);
    const auto session = Read(true, Threads::Everywhere);
    const YAMLMapping& root = session->BaseObjects().GetMapping();
    ASSERT_EQ(Built(root), std::string(299, 'u'));
    std::vector<std::string> seen(4);
    std::vector<std::thread> threads;
    for (std::string& text : seen)
        threads.emplace_back([&] {
            for (const YAMLMapping::Entry entry : root) text += Show(entry.value);
        });
    for (std::thread& thread : threads) thread.join();
    EXPECT_EQ(seen, std::vector<std::string>(4, seen.front()));
    EXPECT_EQ(Built(root), std::string(299, 'b'));
}

TEST_F(UnbuiltTest, WhatStandsOtherwiseThanUsualMayReferToAnything) {
    const auto mayRefer = [](const std::string& fields) {
        OvrinObjects objects;
        struct NoTrees : TreeMaker {
            YAMLMapping* Make(std::string_view) override { throw YAMLError("built"); }
        } maker;
        const YAMLMapping& object = *YAMLMapping::CreateUnbuilt(fields, maker);
        return MayRefer(object, *YAMLScalar::mFather, [](std::string_view id) { return id == "12"; });
    };
    for (const char* no :
         {"a: 12\n", "m_Father: {fileID: 1}\n", "m_Father: {fileID: 123}\n", "{m_Father: {fileID: 2, a: 12}}",
          "m_Father: {fileID: 0}\nm_Father: {fileID: 1}\n"})
        EXPECT_FALSE(mayRefer(no)) << no;
    for (const char* yes : {"m_Father: {fileID: 12}\n", "m_Father: {fileID: 12, guid: a}\n",
                            "m_Father: {fileID: -1}\n", "m_Father: {fileID: 1\n", "m_Father: {fileID: 1",
                            "m_Father: {fileID: 0x}\n", "m_Father: {fileID: '1'}\n", "m_Father: {a: 1}\n",
                            "m_Father:\n", "'m_Father': {fileID: 1}\n", "a: m_Father\n", "m_Father"})
        EXPECT_TRUE(mayRefer(yes)) << yes;
}

} // namespace
