#include "Support/Diffs.h"

#include "Session/Tasks.h"

#include <map>

namespace {

using namespace diffs;

class MappingDiff : public RulesTest {};
class SequenceDiff : public RulesTest {};

std::string Applied(const std::string& target, const YAMLMappingDiff* diff) {
    YAMLMapping* mapping = Doc(target);
    diff->Apply(*mapping);
    return Show(mapping);
}

TEST_F(MappingDiff, KeysAndTheirOrderAreTwoThings) {
    const std::tuple<const char*, const char*, const char*> cases[] = {
        {"", "", "keys [>0] "},
        {"a: 1", "a: 1", "keys [0 >1] "},
        {"a: 1\nb: 2", "b: 2\na: 1", "keys [1 0 >2] "}, // at the root a move is recorded, if not printed
        {"a: 1\nb: 2\nc: 3", "c: 3\na: 9\nd: 4", "keys [1 -1 0 >3: 2 add d] a change 9; b delete; d add 4"},
        {"a: 1", "b: 1", "keys [-1 >1: 0 add b] a delete; b add 1"},
        {"a: 1", "b: 1\na: 1\nc: 1", "keys [1 >3: 0 add b; 2 add c] b add 1; c add 1"}};
    for (const auto& [base, dest, expected] : cases) {
        const YAMLMappingDiff* diff = DiffOf(base, dest);
        EXPECT_EQ(Describe(diff, true), expected) << base << " to " << dest;
        EXPECT_EQ(Applied(base, diff), Show(Doc(dest)));
    }
    EXPECT_FALSE(DiffOf("a: 1\nb: 2", "b: 2\na: 1")->HasKey(YAMLScalar::Lookup("a")));
}

TEST_F(MappingDiff, TheOrderOfANestedMappingIsKeptBesideAnotherChangeOnly) {
    const std::string base = "m:\n  a: 1\n  b: 2";
    EXPECT_EQ(Applied(base, DiffOf(base, "m:\n  b: 2\n  a: 1")), "{m: {a: 1, b: 2}}");
    EXPECT_EQ(Applied(base, DiffOf(base, "m:\n  b: 2\n  a: 3")), "{m: {b: 2, a: 3}}");
}

TEST_F(MappingDiff, AKeyIsChangedOnce) {
    YAMLMappingDiff diff;
    const auto* add = YAMLAlloc<AddOperation>::create(Node("1"), true);
    for (int i = 0; i < 40; ++i) diff.Add(IndexScalar(i), add);
    EXPECT_EQ(ErrorOf([&] { diff.Add(IndexScalar(3), add); }),
              "Cannot do a double change on the same key in a mapping");
    for (int i = 0; i < 41; ++i) EXPECT_EQ(diff.HasKey(IndexScalar(i)), i < 40) << i;
}

TEST_F(MappingDiff, WithoutAKeyOrderNewKeysComeLast) {
    YAMLMappingDiff diff;
    diff.Add(YAMLScalar::Lookup("z"), YAMLAlloc<AddOperation>::create(Node("1"), true));
    diff.Add(YAMLScalar::Lookup("b"), YAMLAlloc<AddOperation>::create(Node("2"), true));
    EXPECT_EQ(Applied("c: 0", &diff), "{c: 0, z: 1, b: 2}");
}

/// A root of many objects, but for what is special.
std::string ManyObjects(const std::string& value, const std::map<int, std::string>& special = {}) {
    std::string text;
    for (int i = 0; i < 5000; ++i) {
        const auto found = special.find(i);
        const std::string object = found == special.end() ? "{b: {x: " + value + "}}" : found->second;
        if (!object.empty()) text += "k" + std::to_string(i) + ": " + object + "\n";
    }
    return text;
}

struct AppliedRoot {
    std::string failure, text;
    std::size_t traits = 0; // objects that were looked at
};

AppliedRoot ApplyToRoot(const std::string& target, const YAMLMappingDiff* diff, const TaskRunner& run) {
    YAMLMapping* root = Doc(target);
    AppliedRoot applied;
    const auto inspect = [](const YAMLMapping& object) {
        return static_cast<std::uint8_t>(object.HasKey(YAMLScalar::Lookup("b")));
    };
    std::string other;
    applied.failure =
        ErrorOf([&] { other = ErrorOf<std::bad_cast>([&] { diff->Apply(*root, run, inspect); }); });
    if (applied.failure == "none") applied.failure = other;
    applied.text = Show(root);
    for (const auto& [key, value] : *root)
        if (const YAMLMapping* object = AsMapping(value)) applied.traits += object->Traits();
    return applied;
}

TEST_F(MappingDiff, ObjectsAreChangedAtOnceAsOneAfterTheOther) {
    const YAMLMappingDiff* changes = DiffOf(ManyObjects("1"), ManyObjects("2", {{7, ""}, {2500, "{b: 5}"}}));
    const TaskRunner atOnce = RunnerFor(Threads::Everywhere);
    const AppliedRoot applied = ApplyToRoot(ManyObjects("1"), changes, atOnce);
    EXPECT_EQ(applied.failure, "none");
    EXPECT_TRUE(applied.text == Applied(ManyObjects("1"), changes));
    EXPECT_EQ(applied.traits, 4999u);
}

TEST_F(MappingDiff, OfObjectsThatAreChangedAtOnceTheFirstThatFailsIsTold) {
    const YAMLMappingDiff* changes = DiffOf(ManyObjects("1"), ManyObjects("2"));
    const std::pair<const char*, const char*> failures[] = {{"", "Cannot get unknown key from yaml mapping"},
                                                            {"text", "std::bad_cast"}};
    for (const int place : {1, 255, 256, 3000, 4998}) {
        for (const auto& [object, failure] : failures) {
            const std::string other = *object ? "" : "text";
            const std::string target = ManyObjects("1", {{place, object}, {place + 1, other}});
            EXPECT_EQ(ApplyToRoot(target, changes, {}).failure, failure) << place;
            EXPECT_EQ(ApplyToRoot(target, changes, RunnerFor(Threads::Everywhere)).failure, failure) << place;
        }
    }
}

TEST_F(MappingDiff, ATargetThatDoesNotFitFails) {
    const YAMLMappingDiff* diff = DiffOf("a: 1\nb: 2", "b: 2\nc: 3");
    EXPECT_EQ(ErrorOf([&] { Applied("a: 1\nb: 2\nx: 0", diff); }),
              "Unmapped key when trying to reorder mapping keys");
    EXPECT_EQ(ErrorOf([&] { Applied("a: 1\nb: 2\nc: 0", diff); }), "Cannot add existing key in YAMLMapping");
    EXPECT_EQ(ErrorOf([&] { DiffOf("a: 1", "a: 1\na: 2"); }),
              "Cannot perform this operation on a YAML file with duplicate keys");
}

/// The position-by-position diff of two lists.
YAMLSequenceDiff* Positions(const std::string& base, const std::string& dest) {
    return YAMLSequenceDiff::Diff(TheRules(), List(base), List(dest));
}

std::string Indexes(const YAMLSequenceDiff* diff) {
    std::string text;
    for (const auto& [index, operation] : diff->Entries())
        text += std::to_string(index) + "=" + Show(As<AddOperation>(operation)->m_Value) + " ";
    return text;
}

/// A diff that adds each index, as its text, at itself.
YAMLSequenceDiff Adds(std::initializer_list<int> indexes) {
    YAMLSequenceDiff diff;
    for (const int index : indexes)
        diff.Add(index, YAMLAlloc<AddOperation>::create(IndexScalar(index), true));
    return diff;
}

TEST_F(SequenceDiff, PositionsAreComparedOneByOne) {
    EXPECT_EQ(Describe(Positions("[]", "[]")), "");
    EXPECT_EQ(Describe(Positions("[a]", "[]")), "0 delete");
    EXPECT_EQ(Describe(Positions("[]", "[a]")), "0 add a");
    EXPECT_EQ(Describe(Positions("[a, b, c]", "[a, x]")), "1 change x; 2 delete");
    YAMLSequence* holes = List("[a]");
    holes->Set(0, nullptr);
    EXPECT_EQ(Describe(YAMLSequenceDiff::Diff(TheRules(), holes, List("[b]"))), "0 add b");
}

TEST_F(SequenceDiff, EntriesStandByIndexAndOnce) {
    YAMLSequenceDiff diff = Adds({5, 1, 3});
    EXPECT_EQ(Indexes(&diff), "1=1 3=3 5=5 ");
    EXPECT_EQ(ErrorOf([&] { diff.Add(3, nullptr); }),
              "Cannot do a double change on the same key in a sequence");
    EXPECT_EQ(ErrorOf([&] { diff.Replace(2, nullptr); }), "Cannot replace non-existing key in a sequence");
    diff.Replace(3, diff.Find(5));
    EXPECT_EQ(Indexes(&diff), "1=1 3=5 5=5 ");
    EXPECT_EQ(diff.Find(4), nullptr);
}

TEST_F(SequenceDiff, IndexesTakenOutMoveTheLaterOnes) {
    const auto without = [](std::initializer_list<int> entries, const std::set<int>& indexes) {
        YAMLSequenceDiff diff = Adds(entries);
        diff.RemoveAndShiftMany(indexes);
        return Indexes(&diff);
    };
    EXPECT_EQ(without({0, 1, 2}, {1}), "0=0 1=2 ");
    EXPECT_EQ(without({0, 1, 2}, {7}), "0=0 1=1 2=2 ");
    EXPECT_EQ(without({2, 5, 9}, {0, 3, 4, 5}), "1=2 5=9 ") << "those without an entry count, too";
    EXPECT_EQ(without({}, {0}), "");
}

TEST_F(SequenceDiff, ARemapMovesDropsAndLetsTheLaterWin) {
    const auto remap = [](std::initializer_list<int> entries, std::vector<int> mapping) {
        YAMLSequenceRemapper remapper(0, 9, true);
        remapper.m_Mapping = std::move(mapping);
        return Indexes(Adds(entries).Remap(&remapper));
    };
    EXPECT_EQ(remap({0, 1, 2}, {2, -1, 0}), "0=2 2=0 ");
    EXPECT_EQ(remap({0, 1, 2}, {4, 4, 1}), "1=2 4=1 ");
    EXPECT_EQ(remap({0, 1, 2}, {3, 3, 3}), "3=2 ");
    EXPECT_EQ(remap({0, 1, 5}, {-1, -1}), "") << "an index beyond the map counts as gone";
}

TEST_F(SequenceDiff, ListsInsideListsChangeInPlace) {
    const char* const base = "l:\n- fileID: 1\n  x: [a, b]\n- fileID: 2\n  x: 1\n- fileID: 3";
    const char* const dest = "l:\n- fileID: 3\n- fileID: 1\n  x: [b]\n- fileID: 4";
    const YAMLMappingDiff* diff = DiffOf(base, dest);
    EXPECT_EQ(Describe(diff), "l [1 -1 0 >3: 1 (x [-1 0 ~>1]); 2 add {fileID: 4}]");
    EXPECT_EQ(Applied(base, diff), Show(Doc(dest)));
}

} // namespace
