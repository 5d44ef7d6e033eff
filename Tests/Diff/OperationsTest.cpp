#include "Diff/CreateDiffOperation.h"
#include "Diff/DiffContext.h"
#include "Support/Diffs.h"
#include "Support/Trees.h"

#include <typeinfo>

namespace {

using namespace diffs;

class Operations : public RulesTest {};

std::string Op(const std::string& path, const std::string& base, const std::string& dest) {
    return Describe(OperationOf(path, base, dest));
}

TEST_F(Operations, TheKindsOfTwoNodesDecide) {
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"", "", " none"},
        {"", "1", " add 1"},
        {"1", "", " delete"},
        {"1", "'1'", " none"},
        {"1", "2", " change 2"},
        {"1", "{a: 1}", " change {a: 1}"},
        {"[1]", "{a: 1}", " change {a: 1}"},
        {"a: 1", "a: 1", " none"},
        {"a: 1\nb: 2", "b: 2\na: 1", " none"}, // below the root the order alone is no difference
        {"a: 1\nb: 2", "b: 2\na: 3", " (a change 3)"},
        {"a: 1\nb: 2\nc: 3", "d: 4\na: 1\nb: 5", " (b change 5; c delete; d add 4)"},
        {"a:\n  b: 1", "a:\n  b: 2", " (a (b change 2))"},
        {"[1, 2]", "[1, 2]", " none"},
        {"[1, 2, 3]", "[1, 9, 3]", " [0 -1 2 ~>3: 1 add 9]"},
        {"[1, 2]", "[2, 1]", " [1 0 ~>2]"},
        {"[]", "{}", " none"}}; // both have the hash 0
    for (const auto& [base, dest, operation] : cases)
        EXPECT_EQ(Op("a", base, dest), operation) << base << dest;
}

TEST_F(Operations, FlowMappingsAreMergedOnlyIfTheyAreReferences) {
    EXPECT_EQ(Op("a", "{x: 1}", "{x: 2}"), "! (x change 2)");
    EXPECT_EQ(Op("a", "{fileID: 1}", "{fileID: 2}"), " (fileID change 2)");
    EXPECT_EQ(Op("a", "{x: 1}", "{x: 1, fileID: 2}"), " (fileID add 2)");
    EXPECT_EQ(Op("a", "x: 1", "{x: 2}"), "! (x change 2)") << "one side in flow style is enough";
    EXPECT_EQ(Op("a", "x: 1", "x: 2"), " (x change 2)");
}

TEST_F(Operations, RulesDecideWhatIsMergedAheadOfTheStyle) {
    Rules("[exclusions]\nexcludeIfContains *.c kind\nincludeIfContains *.c id\nexclude *.c\ninclude *.d\n");
    EXPECT_EQ(Op("1.c", "kind: 1\nid: 1", "kind: 1\nid: 2"), "! (id change 2)");
    EXPECT_EQ(Op("1.c", "{id: 1, x: 1}", "{id: 1, x: 2}"), " (x change 2)") << "the destination has no kind";
    EXPECT_EQ(Op("1.c", "x: 1", "x: 2"), "! (x change 2)");
    EXPECT_EQ(Op("1.d", "{x: 1}", "{x: 2}"), " (x change 2)");
    EXPECT_EQ(Op("1.c", "", "kind: 1"), "! add {kind: 1}");
    EXPECT_EQ(Op("1.c", "kind: 1", ""), "! delete");
    EXPECT_EQ(Op("1.c", "", "x: 1"), " add {x: 1}") << "exclusions without fields are for changes";
}

TEST_F(Operations, AComponentWithANewScriptIsNotMerged) {
    const std::string base = "m_Script: {fileID: 1}\nx: 1", dest = "m_Script: {fileID: 2}\nx: 1";
    EXPECT_EQ(Op("1.MonoBehaviour", base, dest), "! (m_Script (fileID change 2))");
    EXPECT_EQ(Op("1.MonoBehaviour", base, "m_Script: {fileID: 1}\nx: 2"), " (x change 2)");
    for (const char* path : {"1.Other", "MonoBehaviour", "1.MonoBehaviour.x", "MonoBehaviour.1"})
        EXPECT_EQ(Op(path, base, dest), " (m_Script (fileID change 2))") << path;
}

TEST_F(Operations, FloatsWithinTheToleranceAreUnchanged) {
    Rules("[comparisons]\nfloat p 0.01 0.001\nfloat z 0 1\nfloat z 1 1\nfloat n 1 0\nfloat *.s 1 1\nfloat e "
          "0.5 0.5\n");
    const std::tuple<const char*, const char*, const char*, bool> cases[] = {
        {"p", "100", "100.5", false}, {"p", "100", "103", true},   {"p", "0", "0.0005", false},
        {"p", "0", "0.002", true},    {"p", "1", "1.0", false},    {"p", "abc", "x", false}, // both are 0
        {"z", "1", "1.0", true},      {"n", "1", "1.0", true},     {"q", "1", "1.0", true},
        {"p", "1e50", "2e50", false}, {"p", "1e50", "1e38", true}, {"p", "1", "{a: 1}", true},
        {"e", "0", "0.5", true},      {"1.s", "1", "1.5", false},  {"1.2.s", "1", "1.5", true}};
    for (const auto& [path, base, dest, changes] : cases)
        EXPECT_EQ(OperationOf(path, base, dest) != nullptr, changes) << path << " " << base << " " << dest;
}

TEST_F(Operations, EqualHashesCountAsEqualContents) {
    using namespace trees;
    DiffContext context(TheRules());
    EXPECT_EQ(CreateDiffOperation(context, Block({{"a", "1"}}), Block({{"b", "2"}})), nullptr)
        << "never hashed";
    YAMLMapping *a = Doc("a: 1"), *b = Doc("b: 2");
    b->m_Hash = a->m_Hash;
    EXPECT_EQ(CreateDiffOperation(context, a, b), nullptr);
    YAMLMapping* repeated = Block({{"a", "1"}, {"a", "2"}});
    EXPECT_EQ(ErrorOf([&] { CreateDiffOperation(context, Block({}), repeated); }),
              "Cannot perform this operation on a YAML file with duplicate keys")
        << "repeated keys must not vanish";
}

/// The list `target` after the operation, which is asked to change `index`.
std::string Applied(const std::string& target, int index, const Operation* operation) {
    YAMLSequence* list = List(target);
    operation->Apply(*list, index);
    return Show(list);
}

TEST_F(Operations, OnListsNothingShifts) {
    const auto* add = YAMLAlloc<AddOperation>::create(Node("x"), true);
    const auto* change = YAMLAlloc<ChangeOperation>::create(Node("x"));
    const auto* remove = YAMLAlloc<RemoveOperation>::create(true);
    EXPECT_EQ(Applied("[a, b]", 1, add), "[a, x]");
    EXPECT_EQ(Applied("[a, b]", 3, add), "[a, b, ~, x]");
    EXPECT_EQ(Applied("[a, b]", 3, change), "[a, b, ~, x]");
    EXPECT_EQ(Applied("[a, b]", 0, remove), "[~, b]");
    EXPECT_EQ(ErrorOf([&] { Applied("[a]", 1, remove); }),
              "Cannot change non existing index in YAMLSequence");
    EXPECT_EQ(Applied("[a, {b: 1}]", 1, OperationOf("", "{b: 1}", "{b: 2}")), "[a, {b: 2}]");
    EXPECT_EQ(Applied("[[1, 2]]", 0, OperationOf("", "[1, 2]", "[2]")), "[[2]]");
}

TEST_F(Operations, AnApplicationThatDoesNotFitFails) {
    const auto apply = [](const std::string& target, const Operation* operation) {
        operation->Apply(*Doc(target), YAMLScalar::Lookup("a"));
    };
    const Operation* mapping = OperationOf("", "{b: 1}", "{b: 2}");
    const Operation* list = OperationOf("", "[1]", "[2]");
    const Operation* add = OperationOf("", "", "x");
    EXPECT_EQ(ErrorOf([&] { apply("a: 1", add); }), "Cannot add existing key in YAMLMapping");
    EXPECT_EQ(ErrorOf([&] { apply("b: 1", mapping); }), "Cannot get unknown key from yaml mapping");
    EXPECT_EQ(ErrorOf([&] { apply("b: 1", OperationOf("", "1", "2")); }),
              "Cannot change non existing key in YAMLMapping");
    for (const char* target : {"a: 1", "a: [{b: 1}]"}) EXPECT_THROW(apply(target, mapping), std::bad_cast);
    for (const char* target : {"a: 1", "a: {b: 1}"}) EXPECT_THROW(apply(target, list), std::bad_cast);
    YAMLSequence holes;
    holes.GrowTo(1);
    EXPECT_THROW(mapping->Apply(holes, 0), std::bad_cast) << "a hole is no mapping";
}

TEST_F(Operations, ADiffCanBeAppliedAgain) {
    const std::string base = "a: 1\nl: [1, 2]\nm:\n  x: 1", dest = "l: [2, {y: 1}]\nm:\n  x: {z: 1}\nn: [3]";
    const YAMLMappingDiff* diff = DiffOf(base, dest);
    for (int time = 0; time < 2; ++time) {
        YAMLMapping* target = Doc(base);
        diff->Apply(*target);
        EXPECT_EQ(Show(target), Show(Doc(dest)));
        AsMapping(AsMapping(target->Get(YAMLScalar::Lookup("m")))->First())->Clear();
    }
}

} // namespace
