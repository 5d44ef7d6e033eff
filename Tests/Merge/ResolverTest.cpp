#include "Diff/RulesReader.h"
#include "Merge/DiffMerge.h"
#include "Support/Merges.h"

#include <cctype>
#include <set>
#include <sstream>
#include <sys/resource.h>
#include <thread>

namespace {

using namespace merges;

class Resolver : public RulesTest {};

TEST_F(Resolver, EqualChangesAreNoConflictAndOthersKeepTheDefault) {
    struct Case {
        const char *base, *left, *right, *keepBase, *takeLeft, *takeRight, *record;
    };
    const Case cases[] = {
        {"a: 1", "a: 2", "a: 2", "{a: 2}", "{a: 2}", "{a: 2}", "Both changes a: merged\n"},
        {"a: 1", "a: 2", "a: 3", "{a: 1}", "{a: 2}", "{a: 3}", "Both changes a: conflict\n"},
        {"a: 1", "a: 2", "a: {b: 2}", "{a: 1}", "{a: 2}", "{a: {b: 2}}", "Both changes a: conflict\n"},
        {"a: 1", "{}", "{}", "{}", "{}", "{}", "Both removes a: merged\n"},
        {"a: 1", "{}", "a: 2", "{a: 1}", "{}", "{a: 2}", "<unknown conflict type> a: conflict\n"},
        {"a: {x: 1}", "{}", "a: {x: 2}", "{a: {x: 1}}", "{}", "{a: {x: 2}}",
         "<unknown conflict type> a: conflict\n"},
        // A right removal beats any change, a left one a change of a list.
        {"a: 1", "a: 2", "{}", "{}", "{}", "{}", "Right removes a: merged\n"},
        {"a: [1]", "{}", "a: [2]", "{}", "{}", "{}", "Left removes a: merged\n"},
        // A flow mapping that is no reference is one value.
        {"a: {x: 1}", "a: {x: 2}", "a: {x: 2}", "{a: {x: 2}}", "{a: {x: 2}}", "{a: {x: 2}}",
         "Both changes a: merged\n"},
        {"a: {x: 1, y: 1}", "a: {x: 2, y: 1}", "a: {x: 1, y: 2}", "{a: {x: 1, y: 1}}", "{a: {x: 2, y: 1}}",
         "{a: {x: 1, y: 2}}", "Both changes a: conflict\n"},
        {"a:\n  x: 1\n  y: 1", "a:\n  x: 2\n  y: 1", "a:\n  x: 1\n  y: 2", "{a: {x: 2, y: 2}}",
         "{a: {x: 2, y: 2}}", "{a: {x: 2, y: 2}}",
         "Left changes a.x: merged\nRight changes a.y: merged\nBoth changes a: merged\n"}};
    for (const Case& c : cases) {
        const char* const bodies[] = {c.keepBase, c.takeLeft, c.takeRight};
        const MergeResolve defaults[] = {ResolveBase, ResolveLeft, ResolveRight};
        for (int i = 0; i < 3; ++i) {
            const MergeOutput output = Merge({c.base, c.left, c.right, defaults[i]});
            EXPECT_EQ(output.body, bodies[i]) << c.left << " | " << c.right << " default " << defaults[i];
            EXPECT_EQ(output.records, c.record) << c.left << " | " << c.right;
            EXPECT_EQ(output.isPending, std::string(c.record).ends_with("conflict\n")) << c.record;
        }
    }
}

TEST_F(Resolver, ADecisionSettlesWhateverStandsAtItsPath) {
    struct Case {
        const char *base, *left, *right, *byBase, *byLeft, *byRight;
    };
    const Case cases[] = {
        {"a: 1", "a: 2", "a: 3", "{a: 1}", "{a: 2}", "{a: 3}"},
        {"a: 1", "a: 2", "a: 1", "{a: 1}", "{a: 2}", "{a: 1}"},
        {"a: 1", "a: 1", "a: 2", "{a: 1}", "{a: 1}", "{a: 2}"},
        {"a: 1", "{}", "a: 2", "{a: 1}", "{}", "{a: 2}"},
        {"a: 1", "{}", "a: 1", "{a: 1}", "{}", "{a: 1}"},
        {"a: [1]", "a: [2]", "a: [3]", "{a: [1]}", "{a: [2]}", "{a: [3]}"},
        {"a: {x: 1}", "a: {x: 1}", "a: {x: 2}", "{a: {x: 1}}", "{a: {x: 1}}", "{a: {x: 2}}"},
        {"a:\n  x: 1\n  y: 1", "a:\n  x: 2\n  y: 1", "a:\n  x: 1\n  y: 2", "{a: {x: 1, y: 1}}",
         "{a: {x: 2, y: 1}}", "{a: {x: 1, y: 2}}"}};
    for (const Case& c : cases) {
        const std::pair<const char*, const char*> decisions[] = {
            {"base", c.byBase}, {"left", c.byLeft}, {"right", c.byRight}};
        for (const auto& [word, body] : decisions) {
            const MergeOutput output =
                Merge({c.base, c.left, c.right, ResolveRight, word + std::string(" a")});
            EXPECT_EQ(output.body, body) << word << " " << c.left << " | " << c.right;
            EXPECT_TRUE(output.records.ends_with(std::string(" a: ") + word + "\n")) << output.records;
            EXPECT_FALSE(output.isPending);
        }
    }
}

TEST_F(Resolver, AKeyThatBothRemovedHasNoPlaceToGoBackTo) {
    EXPECT_EQ(Merge({"a: 1", "{}", "{}", ResolveBase, "right a"}).body, "{}");
    EXPECT_EQ(ErrorOf([] {
                  Merge({"a: 1", "{}", "{}", ResolveBase, "base a"});
              }),
              "Unmapped key when trying to reorder mapping keys");
}

/// The body that decisions make of a conflict at 1.T.x and another at 2.T.x.
std::string Decide(const std::string& decisions) {
    const auto body = [](const char* value) {
        return std::string("1:\n  T:\n    x: ") + value + "\n2:\n  T:\n    x: " + value;
    };
    const std::string merged = Merge({body("b"), body("l"), body("r"), ResolveBase, decisions}).body;
    return {merged[merged.find("x: ") + 3], merged[merged.rfind("x: ") + 3]};
}

TEST_F(Resolver, DecisionsAreFoundByPatternAndTheFirstCounts) {
    const std::pair<const char*, const char*> cases[] = {
        {"", "bb"},
        {"left *.T.x", "ll"},
        {"left 1.T.x", "lb"},
        {"right 2.T.x\nleft *.T.x", "lr"},
        {"left *.*.x\nright 2.T.x", "ll"},
        {"left *.T.y\nright *.*.*", "rr"},
        {"left *.T", "ll"}, // both sides changed 1.T, so the whole of it is decided
        {"left *.T.x.*\nleft x\nleft *.*.*.*", "bb"},
        {"right 1", "rb"}};
    for (const auto& [decisions, values] : cases) EXPECT_EQ(Decide(decisions), values) << decisions;
}

TEST_F(Resolver, AStarDoesNotReachIntoKeyLists) {
    const std::string base = "a: 1", left = "a: 1\nl: 1", right = "r: 1\na: 1";
    EXPECT_EQ(Merge({base, left, right, ResolveBase, "left *.*"}).body, "{r: 1, a: 1, l: 1}");
    EXPECT_EQ(Merge({base, left, right, ResolveBase, "left *"}).body, "{a: 1, l: 1}");
}

TEST_F(Resolver, AddedContainersAreMergedInside) {
    const std::tuple<const char*, const char*, const char*, const char*> cases[] = {
        {"a: 1", "a: 1", "{a: 1}", "Both adds a: merged\n"},
        {"a: 1", "a: 2", "{}", "Both adds a: conflict\n"},
        {"a: []", "a: {}", "{}", "Both adds a: conflict\n"},
        {"a: {}", "a: {}", "{a: {}}", "Both adds a: merged\n"},
        {"a: {x: 1}", "a: {x: 1}", "{a: {x: 1}}", "Both adds a: merged\n"},
        {"a: {x: 1, y: 2}", "a: {y: 2, x: 1}", "{a: {x: 1, y: 2}}", "Both adds a: merged\n"},
        {"a: {x: 1}", "a: {y: 2}", "{a: {x: 1, y: 2}}",
         "Left adds _.0: merged\nRight adds _.1: merged\nLeft adds a.x: merged\nRight adds a.y: merged\n"},
        {"a: {x: 1, z: 3}", "a: {x: 2}", "{a: {z: 3}}",
         "Both adds _.0: merged\nLeft adds _.0: merged\nLeft adds _.1: merged\nBoth adds a.x: conflict\n"
         "Left adds a.z: merged\n"},
        {"a: {x: 1}", "a: {x: 2}", "{}",
         "Both adds _.0: merged\nLeft adds _.0: merged\nBoth adds a.x: conflict\n"},
        {"a: [1, 2]", "a: [1]", "{a: [1, 2]}", "Both adds a.0: merged\nLeft adds a.1: merged\n"},
        {"a: [1, 2]", "a: [3, 2]", "{a: [2]}", "Both adds a.0: conflict\nBoth adds a.1: merged\n"}};
    const std::string keyList = "Both adds _.0: merged\nLeft adds _.0: merged\n"; // of the root
    for (const auto& [left, right, body, records] : cases) {
        const MergeOutput output = Merge({"{}", left, right});
        EXPECT_EQ(output.body, body) << left << " | " << right;
        EXPECT_EQ(output.records, keyList + records) << left << " | " << right;
    }
}

TEST_F(Resolver, AdditionsNestedDeeplyTakeNoMoreMemoryThanFlatOnes) {
    const auto peak = [] {
        rusage usage{};
        getrusage(RUSAGE_SELF, &usage);
        return usage.ru_maxrss; // KB
    };
    for (const bool isList : {false, true}) {
        const auto nested = [&](const std::string& last) {
            constexpr int kDepth = 900;
            std::string text = "n: ", end = "\n";
            for (int level = 0; level < kDepth; ++level) {
                text += isList ? "[" : "{";
                for (char key = 'A'; key <= 'z'; ++key)
                    if (std::isalpha(key)) text += key + std::string(isList ? ", " : ": 1, ");
                text += isList ? "" : "deeper: ";
                end.insert(0, 1, isList ? ']' : '}');
            }
            return text + last + end;
        };
        const YAMLMappingDiff *left = DiffOf("", nested("1")), *right = DiffOf("", nested("2"));
        RecordingConflictResolver resolver(TheRules(), ResolveLeft);
        const auto before = peak();
        MergeMappingDiffs(left, right, resolver);
        EXPECT_TRUE(resolver.HasPendingConflicts());
        EXPECT_LT(peak() - before, 400 << 10) << "with shared paths and no diffs some tens of MB";
    }
}

TEST_F(Resolver, AnAdditionOfWhichNothingIsLeftIsEmptyUnlessTheBaseIsWanted) {
    EXPECT_EQ(Merge({"{}", "a: {x: 1}", "a: {x: 2}", ResolveRight}).body, "{a: {x: 2}}");
    const std::string decision = "base a.x";
    EXPECT_EQ(Merge({"{}", "a: {x: 1}", "a: {x: 2}", ResolveBase, decision}).body, "{}");
    EXPECT_EQ(Merge({"{}", "a: {x: 1}", "a: {x: 2}", ResolveRight, decision}).body, "{a: {}}");
}

TEST_F(Resolver, ExclusionsKeepChangesOfBothSidesApart) {
    const std::string base = "a:\n  k: 1\n  x: 1", left = "a:\n  k: 1\n  x: 2", right = "a:\n  k: 2\n  x: 1";
    Rules("[exclusions]\nexclude a\n");
    EXPECT_EQ(Merge({base, left, right}).records, "Both changes a: conflict\n");
    EXPECT_EQ(Merge({base, left, left}).records, "Both changes a: merged\n");
    EXPECT_EQ(Merge({"l: [1]", "l: [2]", "l: [3]"}).isPending, false);
    Rules("[exclusions]\nexclude l\n");
    EXPECT_EQ(Merge({"l: [1]", "l: [2]", "l: [3]"}).records, "Both changes l: conflict\n");
    EXPECT_EQ(Merge({"{}", "l: [1]", "l: [1, 2]"}).isPending, true);
}

TEST_F(Resolver, BlanksStandForConflictsWithoutTouchingTheSides) {
    const YAMLMappingDiff* left = DiffOf("a: 1\nb: {x: 1}", "a: 2\nb: {x: 2, y: [3]}");
    const YAMLMappingDiff* right = DiffOf("a: 1\nb: {x: 1}", "b: {x: 3}\na: 3");
    const std::string before = Describe(left);
    RecordingConflictResolver resolver(TheRules(), ResolveBlank);
    EXPECT_EQ(Describe(MergeMappingDiffs(left, right, resolver)), "a change ; b! (x change ; y add [])");
    EXPECT_EQ(Describe(left), before);
    EXPECT_TRUE(resolver.HasPendingConflicts());
}

TEST_F(Resolver, AMergeCanBeDoneAgain) {
    const YAMLMappingDiff* left = DiffOf("a: 1\nl: [1, 2]", "a: 2\nl: [1, 5, 2]");
    const YAMLMappingDiff* right = DiffOf("a: 1\nl: [1, 2]", "a: 3\nl: [2, 6]");
    const std::string before = Describe(left, true) + Describe(right, true);
    std::string first;
    for (int time = 0; time < 2; ++time) {
        RecordingConflictResolver resolver(TheRules(), ResolveLeft);
        const std::string merged = Describe(MergeMappingDiffs(left, right, resolver), true);
        if (time == 0) first = merged;
        EXPECT_EQ(merged, first);
    }
    EXPECT_EQ(Describe(left, true) + Describe(right, true), before);
}

TEST_F(Resolver, ALostDependencyMakesItsRemovalPending) {
    RecordingConflictResolver resolver(TheRules(), ResolveBase);
    MergeMappingDiffs(DiffOf("1: x\n2: y", "2: y"), DiffOf("1: x\n2: y", "1: x\n2: y"), resolver);
    const auto* unknown = YAMLScalar::Lookup("7");
    resolver.OnComponentDependencyConflict({unknown, YAMLScalar::null, ConflictLeftRemoves});
    resolver.OnComponentDependencyConflict({YAMLScalar::null, YAMLScalar::null, ConflictLeftRemoves});
    EXPECT_FALSE(resolver.HasPendingConflicts());
    resolver.OnComponentDependencyConflict({YAMLScalar::null, YAMLScalar::one, ConflictRightRemoves});
    EXPECT_EQ(Records(resolver), "Left removes 1: conflict\n");
    EXPECT_EQ(Describe(resolver.Records()[0].right), " delete");
    EXPECT_EQ(resolver.Records()[0].left, nullptr);
}

TEST_F(Resolver, PathsNoteTheTransformsWhoseParentIsVisited) {
    RecordingConflictResolver resolver(TheRules(), ResolveBase);
    const auto visit = [&](const std::string& path) {
        for (const YAMLScalar* element : PathOf(path)) resolver.PushPath(element);
        resolver.m_Path = {};
        return resolver.ChangedTransforms().size();
    };
    EXPECT_EQ(visit("m_Father"), 0u);
    EXPECT_EQ(visit("1.GameObject.m_Father"), 0u);
    EXPECT_EQ(visit("1.Transform.x.m_Father"), 0u);
    EXPECT_EQ(visit("1.Transform.m_Father"), 1u);
    EXPECT_EQ(visit("1.Transform.m_Father"), 1u);
    EXPECT_EQ(visit("0.x.RectTransform.m_Father"), 2u);
    EXPECT_EQ(resolver.ChangedTransforms()[1], YAMLScalar::zero);
    EXPECT_EQ(ErrorOf([&] { resolver.PopPath(); }), "Tried to pop on empty ConflictResolver path");
}

const char* const kBase = "a: 1\nb: 1\nc: {x: 1, fileID: 1}\nl: [1]\nz: 1";

TEST_F(Resolver, TheSidePickerTakesItsSideAndMergesMappingsOnly) {
    const YAMLMappingDiff* left = DiffOf(kBase, "a: 2\nc: {x: 2, fileID: 1}\nl: [1, 2]\nn: 1\nz: 1");
    const YAMLMappingDiff* right = DiffOf(kBase, "a: 2\nb: 3\nc: {x: 1, fileID: 3}\nl: [3, 1]\nn: 2\nz: 9");
    const auto merge = [&](MergeResolve side) {
        SidePickingConflictResolver resolver(TheRules(), side);
        YAMLMapping* body = Doc(kBase);
        MergeMappingDiffs(left, right, resolver)->Apply(*body);
        return Show(body);
    };
    EXPECT_EQ(merge(ResolveLeft), "{a: 2, c: {x: 2, fileID: 3}, l: [1, 2], n: 1, z: 9}");
    EXPECT_EQ(merge(ResolveRight), "{a: 2, b: 3, c: {x: 2, fileID: 3}, l: [3, 1], n: 2, z: 9}");
    for (const MergeResolve side : {ResolveBase, ResolveMerged, ResolveNone})
        EXPECT_EQ(ErrorOf([&] { SidePickingConflictResolver resolver(TheRules(), side); }),
                  "SidePickingConflictResolver only accepts side left or right");
}

TEST_F(Resolver, TheStrictOneThrowsWhereBothSidesTouchedAKey) {
    const std::tuple<const char*, const char*, const char*, const char*> cases[] = {
        {"a: 1", "a: 2", "a: 2", "Conflict for same value changed a"},
        {"a: 1", "{}", "a: 2", "Conflict for removed value changed a"},
        {"a: {x: 1}", "{}", "a: {x: 2}", "Conflict for removed value changed a in right file"},
        {"a: {x: 1}", "a: {x: 2}", "a: {x: 2}", "Conflict for same mapping changed a"},
        {"a: [1]", "a: [2]", "a: [2]", "Conflict for same sequence changed a"},
        {"a: 1", "{}", "{}", "none"},
        {"a: 1\nb: 1", "a: 2\nb: 1", "a: 1\nb: 2", "none"}};
    for (const auto& [base, left, right, error] : cases) {
        const YAMLMappingDiff *l = DiffOf(base, left), *r = DiffOf(base, right);
        ExceptionConflictResolver resolver(TheRules());
        EXPECT_EQ(ErrorOf([&] { MergeMappingDiffs(l, r, resolver); }), error);
    }
    ExceptionConflictResolver resolver(TheRules());
    resolver.m_Path = PathOf("1.T.n");
    AddOperation add(Doc("\n\na: 1"), true);
    EXPECT_EQ(ErrorOf([&] { resolver.OnSameValueAdded(&add, &add); }),
              "Conflict for same value added 1.T.n at line 2");
}

/// The merge of one scene by the rules of a file, again and again; what comes out, each result once.
std::set<std::string> MergesBy(const std::string& file) {
    static const char* const kScene = "f: 1\nl: [{id: 1, x: 1}, {id: 2}]\nm:\n  a: 1\n  b: 1";
    MergeRules rules;
    std::istringstream stream(file);
    LoadSequenceUniqueKeys(stream, rules);
    const auto diff = [&](const char* side) { return YAMLMappingDiff::Diff(rules, Doc(kScene), Doc(side)); };
    std::set<std::string> results;
    for (int time = 0; time < 300; ++time) {
        RecordingConflictResolver resolver(rules, ResolveBase);
        YAMLMapping* body = Doc(kScene);
        MergeMappingDiffs(diff("f: 1.4\nl: [{id: 2}, {id: 1, x: 1}]\nm:\n  a: 2\n  b: 1"),
                          diff("f: 1\nl: [{id: 1, x: 2}, {id: 2}]\nm:\n  a: 1\n  b: 2"), resolver)
            ->Apply(*body);
        results.insert(Show(body));
    }
    return results;
}

TEST_F(Resolver, MergesUnderDifferentRulesDoNotKnowOfEachOther) {
    std::set<std::string> byNone, bySome;
    std::thread none([&] { byNone = MergesBy(""); });
    bySome = MergesBy("[arrays]\nset l id\n[exclusions]\nexclude m\n[comparisons]\nfloat f 1 1");
    none.join();
    EXPECT_EQ(byNone, std::set<std::string>{"{f: 1.4, l: [{id: 1, x: 2}, {id: 2}], m: {a: 2, b: 2}}"});
    EXPECT_EQ(bySome, std::set<std::string>{"{f: 1, l: [{id: 2}, {id: 1, x: 2}], m: {a: 1, b: 1}}"});
}

} // namespace
