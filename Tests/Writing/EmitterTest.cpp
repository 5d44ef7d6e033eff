#include "ErrorOf.h"
#include "Support/Trees.h"
#include "Values/OvrinObjects.h"
#include "Writing/ObjectFileWriter.h"
#include "Writing/YAMLEmitter.h"

#include <gtest/gtest.h>

#include <memory>
#include <sstream>
#include <string>

namespace {

using namespace trees;
using std::string;

string W(int count) {
    return string(static_cast<std::size_t>(count), 'w');
}

/// A text as value in a block mapping and as item of a flow list.
struct ScalarCase {
    string text, inBlock, inFlow;
};

TEST(Emitter, QuotesATextOnlyWhereItMust) {
    const ScalarCase cases[] = {
        {"", "", "''"},
        {"~", "~", "~"},
        {"it's", "it's", "it's"},
        {"a\\b<c>=\"d\"&*!|%@`", "a\\b<c>=\"d\"&*!|%@`", "a\\b<c>=\"d\"&*!|%@`"},
        {"'a'", "'''a'''", "'''a'''"},
        {"a:b", "a:b", "'a:b'"},
        {"a,b", "a,b", "'a,b'"},
        {"a?", "a?", "'a?'"},
        {"?a", "?a", "'?a'"},
        {":a", ":a", "':a'"},
        {"?", "'?'", "'?'"},
        {"a: b", "'a: b'", "'a: b'"},
        {"a:", "'a:'", "'a:'"},
        {"a#b", "a#b", "a#b"},
        {"a #b", "'a #b'", "'a #b'"},
        {"-", "'-'", "'-'"},
        {"-1", "-1", "-1"},
        {"- a", "'- a'", "'- a'"},
        {"---a", "'---a'", "'---a'"},
        {"..", "..", ".."},
        {"...", "'...'", "'...'"},
        {" a", "' a'", "' a'"},
        {"a ", "'a '", "'a '"},
        {"a\tb", R"("a\tb")", R"("a\tb")"},
        {"a\r", R"("a\r")", R"("a\r")"},
        {"a \nb", R"("a \nb")", R"("a \nb")"},
        {"a\n b", R"("a\n b")", R"("a\n b")"},
        {"a\n\nb", "'a\n\n\n  b'", "'a\n\n\n    b'"},
        {"\na", "'\n\n  a'", "'\n\n    a'"},
        {"a\n", "'a\n\n'", "'a\n\n'"},
        {"\xFF\"\\\x7F", R"("\xFF\"\\\x7F")", R"("\xFF\"\\\x7F")"},
        {"\xE6\x97", R"("\xE6\x97")", R"("\xE6\x97")"},
        {"\u00FF\u65E5\U0001F600", R"("\xFF\u65E5\U0001F600")", R"("\xFF\u65E5\U0001F600")"},
        {"\u0085\u00A0\u2028\u2029", R"("\N\_\L\P")", R"("\N\_\L\P")"},
    };
    for (const ScalarCase& c : cases) {
        EXPECT_EQ(GetYAMLString(*Block({{"k", std::string_view(c.text)}})), "k: " + c.inBlock);
        EXPECT_EQ(GetYAMLString(*Block({{"k", FlowList({std::string_view(c.text)})}})),
                  "k: [" + c.inFlow + "]");
    }
}

struct TreeCase {
    Tree tree;
    string text;
};

void ExpectTexts(std::initializer_list<TreeCase> cases) {
    for (const TreeCase& c : cases) EXPECT_EQ(GetYAMLString(*c.tree.node), c.text);
}

TEST(Emitter, LaysOutBlocksLikeTheEditor) {
    ExpectTexts({
        {Block({{"a", Block({{"b", Block({{"c", "1"}})}})}, {"d", ""}}), "a:\n  b:\n    c: 1\nd: "},
        {Block({{"l", BlockList({"x", "", Block({{"a", "1"}, {"b", BlockList({"y"})}})})}}),
         "l:\n- x\n- \n- a: 1\n  b:\n  - y"},
        {BlockList({BlockList({"a", BlockList({"b"})}), Flow({{"c", ""}})}), "- - a\n  - - b\n- {c: ''}"},
        {Block({{"a", Block({})}, {"b", BlockList({})}, {"c", FlowList({Flow({}), FlowList({})})}}),
         "a: {}\nb: []\nc: [{}, []]"},
        {Flow({{"a", Block({{"b", BlockList({"c", "d"})}})}}), "{a: {b: [c, d]}}"},
    });
}

TEST(Emitter, EndsAPlainRootWithAMark) {
    ExpectTexts(
        {{"abc", "abc\n..."}, {"", "\n..."}, {"a: b", "'a: b'"}, {"a\n", "'a\n\n'"}, {FlowList({}), "[]"}});
}

TEST(Emitter, WritesLongAndMultilineKeysExplicitly) {
    const string simple = W(128), longer = W(129), blanks = W(81) + " " + W(60);
    ExpectTexts({
        {Block({{simple, "v"}, {"", "e"}}), simple + ": v\n'': e"},
        {Block({{longer, ""}, {"b", ""}}), "? " + longer + "\n: \nb: "},
        {Block({{longer, BlockList({"a", "b"})}}), "? " + longer + "\n: - a\n  - b"},
        {Block({{longer, Block({{"a", "1"}, {"b", "2"}})}}), "? " + longer + "\n: a: 1\n  b: 2"},
        {Block({{"a\nb", "v"}, {"a\t\n", "v"}}), "? 'a\n\n  b'\n: v\n? \"a\\t\\n\"\n: v"},
        {Block({{blanks, "v"}}), "? " + W(81) + "\n  " + W(60) + "\n: v"},
        {Flow({{"a", "b"}, {longer, ""}}), "{a: b, ? " + longer + "\n  : ''}"},
        {Flow({{"a\nb", "v"}}), "{? 'a\n\n    b' : v}"},
    });
}

TEST(Emitter, FoldsBehindColumn80) {
    const string at80 = W(77), at81 = W(78); // behind "k: "
    ExpectTexts({
        {Block({{"k", std::string_view(at80 + " a b")}}), "k: " + at80 + " a\n  b"},
        {Block({{"k", std::string_view(at81 + " a b")}}), "k: " + at81 + "\n  a b"},
        {Block({{"k", std::string_view(at81 + "  a b")}}), "k: " + at81 + "  a\n  b"},
        {Block({{"k", std::string_view(at81 + "#: ")}}), "k: '" + at81 + "#: '"},
        {Block({{"k", std::string_view(at81 + ": a")}}), "k: '" + at81 + ":\n  a'"},
        {Block({{"k", std::string_view(at81 + "\t  a ")}}), "k: \"" + at81 + "\\t\n  \\ a \""},
        {Block({{at81 + " a b c", "v"}}), at81 + " a b c: v"},
        {std::string_view(W(81) + " a"), W(81) + "\n  a\n..."},
    });
}

TEST(Emitter, BreaksFlowCollectionsBehindColumn80) {
    const string upTo80 = W(75), upTo81 = W(76); // behind "k: [" and before ","
    ExpectTexts({
        {Block({{"k", FlowList({std::string_view(upTo80), "a"})}}), "k: [" + upTo80 + ", a]"},
        {Block({{"k", FlowList({std::string_view(upTo81), "a"})}}), "k: [" + upTo81 + ",\n  a]"},
        {Block({{W(79), FlowList({"a"})}}), W(79) + ": [\n  a]"},
        {Block({{W(79), Flow({})}}), W(79) + ": {}"},
        {BlockList({Flow({{W(80), Flow({{"a", "b"}})}})}), "- {" + W(80) + ": {\n    a: b}}"},
    });
}

TEST(Emitter, WritesRepeatedKeysAsRead) {
    ExpectTexts(
        {{Block({{"k", Block({{"a", "1"}, {"b", "2"}, {"a", "3"}})}}), "k:\n  a: 1\n  b: 2\n  a: 3"}});
}

TEST(Emitter, PassesOverRemovedPairs) {
    YAMLMapping* mapping = Block({});
    for (int i = 0; i < 40; ++i) mapping->Append(IndexScalar(i), YAMLScalar::Lookup("v"));
    for (int i = 0; i < 39; ++i) mapping->Remove(IndexScalar(i));
    EXPECT_EQ(GetYAMLString(*mapping), "39: v");
    mapping->Remove(IndexScalar(39));
    EXPECT_EQ(GetYAMLString(*mapping), "{}");
}

class ObjectFileWriter : public testing::Test {
protected:
    static void SetUpTestSuite() { initialize(); }

    void Add(std::string_view key, TreePairs pairs, bool flow = false) {
        m_Objects.GetMapping().Append(YAMLScalar::Lookup(key), Mapping(pairs, flow));
    }

    /// Everything behind the header lines, whose tag authority belongs to the build.
    static std::string Body(const OvrinObjects& objects, const TaskRunner& run = {}) {
        std::ostringstream stream;
        Output(objects, stream, run);
        const string text = stream.str();
        const std::size_t end = text.find(",2011:\n");
        EXPECT_TRUE(text.starts_with("%YAML 1.1\n%TAG !o! tag:") && end != string::npos);
        return text.substr(end + 7);
    }

    OvrinObjects m_Objects;
};

TEST_F(ObjectFileWriter, MakesHeaderLinesFromThePlaceHolders) {
    Add("1", {{"MERGE_FileID", "7"}, {"A", Block({{"m", ""}})}, {"MERGE_ClassID", "4"}});
    Add("2",
        {{"B", Block({})}, {"MERGE_ClassID", "1"}, {"MERGE_FileID", "2"}, {"MERGE_StrippedPrefab", "1"}});
    Add("3", {{"MERGE_FileID", "3"}, {"MERGE_ClassID", "5"}});
    Add("4", {{"A", "b"}, {"MERGE_ClassID", "6"}}, true);
    EXPECT_EQ(Body(m_Objects), "--- !o!4 &7\nA:\n  m: \n--- !o!1 &2 stripped\nB: {}\n--- !o!5 &3\n{}\n"
                               "--- !o!6 &4\n{A: b}\n");
}

TEST_F(ObjectFileWriter, WritesAFileWithoutObjects) {
    EXPECT_EQ(Body(m_Objects), "");
}

TEST_F(ObjectFileWriter, WritesFilesLongerThanAPiece) {
    const string text = W(1000);
    string expected;
    for (int i = 0; i < 1200; ++i) {
        Add(IntToString(i), {{"A", std::string_view(text)}, {"MERGE_ClassID", "1"}});
        expected += "--- !o!1 &" + IntToString(i) + "\nA: " + text + "\n";
    }
    EXPECT_EQ(Body(m_Objects), expected);
}

TEST_F(ObjectFileWriter, RefusesObjectsWithoutClassOrWithRepeatedKeys) {
    const auto problem = [&] {
        try {
            return Body(m_Objects);
        } catch (const YAMLError& error) {
            return error.what();
        }
    };
    Add("1", {{"A", "1"}, {"MERGE_FileID", "1"}, {"MERGE_ClassID", "1"}, {"A", "2"}});
    EXPECT_EQ(problem(), "Cannot perform this operation on a YAML file with duplicate keys");
    m_Objects.GetMapping().Clear();
    Add("12", {{"A", "1"}, {"MERGE_FileID", "12"}});
    EXPECT_EQ(problem(), "Object has no class id: 12");
}

TEST_F(ObjectFileWriter, ManyObjectsAreTheSameInWhateverOrderTheyAreWritten) {
    std::size_t runs = 0;
    const TaskRunner backwards = [&](std::size_t count, const std::function<void(std::size_t)>& task) {
        for (++runs; count > 0;) task(--count);
    };
    YAMLMapping& root = m_Objects.GetMapping();
    for (int i = 0; i < 20000; ++i) {
        Add(IntToString(i), {{"A", std::string_view(IntToString(i))}, {"MERGE_ClassID", "1"}});
        if (i % 7 == 0) AsMapping(root.Get(IndexScalar(i)))->SetSource("--- !o!1 &0\nB: 1\n");
    }
    for (const int i : {0, 255, 256, 19999}) root.Remove(IndexScalar(i));
    const string expected = Body(m_Objects);
    EXPECT_TRUE(Body(m_Objects, backwards) == expected);
    EXPECT_EQ(runs, 3u);
    for (const int i : {15000, 9001, 9000})
        ToMapping(root.GetForChange(IndexScalar(i))).Remove(YAMLScalar::classIDPlaceHolderName);
    EXPECT_EQ(failures::ErrorOf([&] { Body(m_Objects, backwards); }), "Object has no class id: 9000");
}

TEST_F(ObjectFileWriter, CloneIsACopyOfItsOwn) {
    Add("1", {{"A", Block({{"m", "1"}})}, {"MERGE_ClassID", "4"}});
    const std::unique_ptr<OvrinObjects> clone(m_Objects.Clone());
    YAMLNode* object = m_Objects.GetMapping().GetForChange(YAMLScalar::Lookup("1"));
    ToMapping(object).Change(YAMLScalar::Lookup("A"), YAMLScalar::Lookup("2"));
    EXPECT_EQ(Body(*clone), "--- !o!4 &1\nA:\n  m: 1\n");
    EXPECT_EQ(Body(m_Objects), "--- !o!4 &1\nA: 2\n");
}

} // namespace
