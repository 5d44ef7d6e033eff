#include "Merge/SequenceMerge.h"
#include "Diff/OperationComparison.h"
#include "Merge/OperationMerge.h"
#include "Merge/RemapperMerge.h"
#include "Support/Merges.h"

#include <map>
#include <random>

namespace {

using namespace merges;

class SequenceMerge : public RulesTest {};

/// The merged list of three lists; elements of equal texts under equality, references under their key.
std::string MergedList(const std::string& base, const std::string& left, const std::string& right) {
    const std::string merged = Merged("l: " + base, "l: " + left, "l: " + right);
    return merged.substr(4, merged.size() - 5);
}

TEST_F(SequenceMerge, AdditionsStayBehindWhatTheyFollowAndTheLeftOnesGoFirst) {
    const std::tuple<const char*, const char*, const char*, const char*> cases[] = {
        {"[a, b, c]", "[a, x, b, c]", "[a, b, y, c]", "[a, x, b, y, c]"},
        {"[a, b]", "[a, x, b]", "[a, y, b]", "[a, x, y, b]"},
        {"[a, b]", "[x, a, b]", "[y, a, b]", "[x, y, a, b]"},
        {"[a, b]", "[a, b, x]", "[a, b, x]", "[a, b, x]"}, // the same change is one
        {"[a, b]", "[a, b, x]", "[a, b, x, y]",
         "[a, b, x, x, y]"}, // without keys nothing is the same element
        {"[a, b, c]", "[a, b, x, c]", "[a, c]", "[a, x, c]"},
        {"[a, b, c]", "[c, a, b]", "[a, b, c]", "[c, a, b]"},       // the move of one side
        {"[a, b, c]", "[c, a, b]", "[a, b, c, d]", "[a, b, c, d]"}, // is lost beside a change of the other
        {"[a, b, c]", "[c, a, b]", "[c, a, b]", "[a, b, c]"},       // pure moves have no entries to be equal
        {"[]", "[x]", "[y]", "[x, y]"},
        {"[a]", "[]", "[]", "[]"},
        {"[a, b]", "[]", "[a, x, b]", "[x]"}};
    for (const auto& [base, left, right, merged] : cases)
        EXPECT_EQ(MergedList(base, left, right), merged) << left << " | " << right;
}

TEST_F(SequenceMerge, ARemovalBeatsAChangeOfTheElement) {
    Rules("[arrays]\nset l id\n");
    const std::string base = "l: [{id: 1}, {id: 2, x: 1}]", removed = "l: [{id: 1}]";
    const std::string changed = "l: [{id: 1}, {id: 2, x: 2}]", more = "l: [{id: 1}, {id: 2, x: 2}, {id: 3}]";
    for (const auto& [left, right] : {std::pair(removed, changed), std::pair(changed, removed)}) {
        EXPECT_EQ(Merge({base, left, right}).body, "{l: [{id: 1}]}");
        EXPECT_EQ(Merge({base, left, right}).records, "Both changes l: merged\n") << "nobody was asked";
    }
    EXPECT_EQ(Merge({base, removed, more}).body, "{l: [{id: 1}, {id: 3}]}");
    EXPECT_FALSE(Merge({base, removed, more}).isPending);
}

TEST_F(SequenceMerge, AKeyListKeepsWhatOneSideKept) {
    const char* const base = "a: 1\nb: 1\nc: 1";
    EXPECT_EQ(Merged(base, "a: 1\nc: 1", "a: 1\nb: 2\nc: 1"), "{a: 1, b: 1, c: 1}") << "a conflict about b";
    EXPECT_EQ(Merged(base, "a: 1\nc: 1", "a: 1\nb: 1\nn: 1\nc: 1"), "{a: 1, n: 1, c: 1}");
    EXPECT_EQ(Merged(base, "c: 1\na: 1\nb: 1", "a: 1\nb: 1\nc: 1\nd: 1"), "{a: 1, b: 1, c: 1, d: 1}");
}

TEST_F(SequenceMerge, KeyListsOfOneHashAreNotEqual) {
    const char* const base = "p0: 1\nb13183: 1";
    EXPECT_EQ(Merged(base, "a278043: 1", "p0: 2\nb13183: 1"), "{a278043: 1, p0: 1}") << "a conflict about p0";
    EXPECT_EQ(Merged(base, "a278043: 1", "p0: 1\nb13183: 1\nn: 1"), "{a278043: 1, n: 1}");
}

TEST_F(SequenceMerge, TakesAnyTwoMaps) {
    std::vector<YAMLSequenceRemapper> maps;
    for (const std::size_t count : {0, 1, 3})
        for (const std::vector<int>& mapping : std::vector<std::vector<int>>{
                 {}, {0}, {-1}, {-7}, {1 << 30}, {0, 0}, {2, 1, 0}, {3, 2}, {0, 9, 1, -2, 2, 1}}) {
            maps.emplace_back(0, count, true);
            maps.back().m_Mapping = mapping;
        }
    for (const YAMLSequenceRemapper& left : maps) {
        for (const YAMLSequenceRemapper& right : maps) {
            const auto [merged, leftToMerged, rightToMerged] = MergeRemappers(&left, &right, &left < &right);
            EXPECT_EQ(merged->m_Mapping.size(), left.m_Mapping.size());
            for (const auto* map :
                 std::initializer_list<const YAMLSequenceRemapper*>{merged, leftToMerged, rightToMerged})
                for (const int target : map->m_Mapping)
                    EXPECT_LT(target, static_cast<int>(merged->m_DestinationCount));
        }
    }
}

TEST_F(SequenceMerge, AnElementThatBothAddedUnderOneKeyIsThereOnce) {
    const char* const base = "l: [{fileID: 1}]";
    EXPECT_EQ(Merged(base, "l: [{fileID: 1}, {fileID: 2}, {fileID: 3}]",
                     "l: [{fileID: 4}, {fileID: 1}, {fileID: 2}]"),
              "{l: [{fileID: 4}, {fileID: 1}, {fileID: 2}, {fileID: 3}]}");
    const MergeOutput inner = Merge(
        {base, "l: [{fileID: 5}, {fileID: 1}, {fileID: 2, x: 1}]", "l: [{fileID: 1}, {fileID: 2, y: 1}]"});
    EXPECT_EQ(inner.body, "{l: [{fileID: 5}, {fileID: 1}, {fileID: 2, x: 1, y: 1}]}");
    EXPECT_NE(inner.records.find("Left adds l.2.x: merged\n"), std::string::npos) << "2 is its left index";
    const MergeOutput conflict =
        Merge({base, "l: [{fileID: 2, x: 1}, {fileID: 1}]", "l: [{fileID: 1}, {fileID: 2, x: 2}]"});
    EXPECT_EQ(conflict.body, "{l: [{fileID: 2}, {fileID: 1}]}");
    EXPECT_NE(conflict.records.find("Both adds l.0.x: conflict\n"), std::string::npos);
}

TEST_F(SequenceMerge, AConflictThatKeepsTheBaseCanCostALaterElementItsPlace) {
    Rules("[arrays]\nset l id\n");
    const auto list = [](const char* x, const char* last) {
        return std::string("l: [{id: 0, x: ") + x + "}, {id: 1}, {id: 2}, {id: " + last + "}]";
    };
    // Index 0 leaves the numbering 0 1 2 3, the third entry with it: 0 1 2 of three.
    EXPECT_EQ(Merge({list("b", "3"), list("l", "3"), list("r", "3")}).body,
              "{l: [{id: 0, x: b}, {id: 1}, {id: 2}, {id: 3}]}")
        << "nothing moved: no numbering to lose";
    const MergeOutput output = Merge({list("b", "3"), list("l", "4"), list("r", "5")});
    EXPECT_TRUE(output.isPending);
    EXPECT_EQ(output.body, "{l: [{id: 0, x: b}, {id: 1}, {id: 4}, {id: 5}]}");
}

// The merge of two list changes once more, step by step and without any thought of cost.

struct Numbering {
    std::vector<int> mapping;
    int count = 0;
    bool isSet = false;
};
using Entries = std::map<int, const Operation*>;

Entries EntriesOf(const YAMLSequenceDiff* diff) {
    Entries entries;
    for (const auto& [index, operation] : diff->Entries()) entries[index] = operation;
    return entries;
}

void ShiftDown(Numbering& numbering, int index) {
    if (numbering.count <= index) return;
    --numbering.count;
    std::erase(numbering.mapping, index);
    for (int& target : numbering.mapping) target -= target > index;
}

Entries Remapped(const Entries& entries, const std::vector<int>& mapping) {
    Entries result;
    for (const auto& [index, operation] : entries)
        if (index < static_cast<int>(mapping.size()) && mapping[index] != -1)
            result[mapping[index]] = operation;
    return result;
}

Entries Without(const Entries& entries, const std::set<int>& indexes) {
    Entries result;
    for (const auto& [index, operation] : entries)
        if (!indexes.count(index))
            result[index - static_cast<int>(std::distance(indexes.begin(), indexes.lower_bound(index)))] =
                operation;
    return result;
}

/// What both added under one key, settled by the resolver.
void SettleCommonAdditions(Entries& left, Entries& right, Numbering& rightNumbering,
                           ConflictResolver& resolver) {
    const auto keyOf = [](const Operation* operation) {
        const auto* add = As<AddOperation>(operation);
        const auto* mapping = add ? AsMapping(add->m_Value) : nullptr;
        const auto* key = mapping ? AsScalar(mapping->Get(YAMLScalar::fileID)) : nullptr;
        return key ? std::string(key->Value()) : "";
    };
    const Entries before = left;
    std::set<int> matched;
    for (const auto& [index, operation] : before) {
        const auto match =
            std::find_if(right.rbegin(), right.rend(), [&, mine = operation](const auto& entry) {
                return !keyOf(mine).empty() && keyOf(entry.second) == keyOf(mine);
            });
        if (match == right.rend()) continue;
        resolver.PushPath(IndexScalar(index));
        left[index] = MergeOperations(operation, match->second, resolver);
        resolver.PopPath();
        matched.insert(match->first);
    }
    right = Without(right, matched);
    for (auto index = matched.rbegin(); index != matched.rend(); ++index) ShiftDown(rightNumbering, *index);
}

/// Merged indexes of left and right elements, and of base elements.
struct MergedNumbers {
    std::vector<int> left, right;
    Numbering base;
};

MergedNumbers MergeNumbers(const Numbering& left, const Numbering& right) {
    MergedNumbers merged{std::vector<int>(left.count, -1), std::vector<int>(right.count, -1), {}};
    int next = 0;
    const auto isNew = [](const Numbering& side, int k) {
        return std::find(side.mapping.begin(), side.mapping.end(), k) == side.mapping.end();
    };
    const auto additions = [&](const Numbering& side, std::vector<int>& numbers, int k) {
        for (; k < side.count && isNew(side, k); ++k) numbers[k] = next++;
    };
    additions(left, merged.left, 0);
    additions(right, merged.right, 0);
    for (std::size_t i = 0; i < left.mapping.size(); ++i) {
        const int l = left.mapping[i], r = right.mapping[i];
        const bool stays = l != -1 && r != -1;
        if (stays) merged.left[l] = merged.right[r] = next;
        merged.base.mapping.push_back(stays ? next++ : -1);
        if (l != -1) additions(left, merged.left, l + 1);
        if (r != -1) additions(right, merged.right, r + 1);
    }
    merged.base.count = next;
    merged.base.isSet = left.isSet && right.isSet;
    return merged;
}

std::string NaiveMerge(const ChangeSequenceOperation* leftOne, const ChangeSequenceOperation* rightOne,
                       ConflictResolver& resolver) {
    Entries left = EntriesOf(leftOne->m_Diff), right = EntriesOf(rightOne->m_Diff);
    const auto numberingOf = [](const YAMLSequenceRemapper* remapper) {
        return Numbering{remapper->m_Mapping, static_cast<int>(remapper->m_DestinationCount),
                         remapper->m_IsSet};
    };
    Numbering base;
    if (leftOne->m_Remapper && rightOne->m_Remapper) {
        Numbering l = numberingOf(leftOne->m_Remapper), r = numberingOf(rightOne->m_Remapper);
        if (!left.empty() && !right.empty() && OperationEquals(leftOne, rightOne)) return Describe(leftOne);
        if (l.isSet) SettleCommonAdditions(left, right, r, resolver);
        const MergedNumbers merged = MergeNumbers(l, r);
        left = Remapped(left, merged.left);
        right = Remapped(right, merged.right);
        base = merged.base;
    } else if (const auto* only = leftOne->m_Remapper ? leftOne->m_Remapper : rightOne->m_Remapper) {
        base = numberingOf(only);
        Entries& other = leftOne->m_Remapper ? right : left;
        if (!base.mapping.empty()) other = Remapped(other, base.mapping);
    }
    std::set<int> indexes, dropped;
    for (const Entries* entries : {&left, &right})
        for (const auto& entry : *entries) indexes.insert(entry.first);
    YAMLSequenceDiff diff;
    for (const int index : indexes) {
        resolver.PushPath(IndexScalar(index));
        const Operation* operation = MergeOperations(left.count(index) ? left[index] : nullptr,
                                                     right.count(index) ? right[index] : nullptr, resolver);
        resolver.PopPath();
        if (operation)
            diff.Add(index, operation);
        else
            dropped.insert(index);
    }
    YAMLSequenceRemapper remapper(0, 0, base.isSet);
    const bool hasNumbering = !base.mapping.empty();
    if (hasNumbering)
        for (auto index = dropped.rbegin(); index != dropped.rend(); ++index) ShiftDown(base, *index);
    remapper.m_Mapping = base.mapping;
    remapper.m_DestinationCount = static_cast<std::size_t>(base.count);
    const ChangeSequenceOperation result(&diff, hasNumbering ? &remapper : nullptr,
                                         leftOne->m_Mergeable && rightOne->m_Mergeable);
    return Describe(&result);
}

/// A list of references with a field each, or of texts, edited from `items`.
YAMLSequence* Edited(std::vector<std::string> items, bool keyed, std::mt19937& random) {
    for (std::size_t edits = random() % 5; edits > 0; --edits) {
        const std::size_t at = items.empty() ? 0 : random() % items.size();
        const std::string element = keyed ? "{fileID: " + std::to_string(10 + random() % 4) + ", x: 1}"
                                          : std::to_string(random() % 5);
        switch (items.empty() ? 0 : random() % 4) {
        case 0:
            items.insert(items.begin() + static_cast<std::ptrdiff_t>(at), element);
            break;
        case 1:
            items.erase(items.begin() + static_cast<std::ptrdiff_t>(at));
            break;
        case 2:
            std::swap(items[at], items[random() % items.size()]);
            break;
        default:
            if (keyed) items[at].replace(items[at].find("x: ") + 3, 1, std::to_string(random() % 5));
        }
    }
    std::string text;
    for (const std::string& item : items) text += (text.empty() ? "" : ", ") + item;
    return List("[" + text + "]");
}

TEST_F(SequenceMerge, IsWhatItsStepsSay) {
    int merges = 0, conflicts = 0;
    for (unsigned seed = 0; seed < 20000; ++seed) {
        std::mt19937 random(seed);
        const bool keyed = random() % 2;
        std::vector<std::string> items;
        for (std::size_t i = random() % 6; i > 0; --i)
            items.push_back(keyed ? "{fileID: " + std::to_string(i) + ", x: 0}" : std::to_string(i));
        std::string baseText = "[";
        for (const std::string& item : items) baseText += (baseText.size() > 1 ? ", " : "") + item;
        const std::string base = baseText + "]";
        const YAMLSequence *left = Edited(items, keyed, random), *right = Edited(items, keyed, random);
        const auto* l = As<ChangeSequenceOperation>(OperationOf("l", base, Show(left)));
        const auto* r = As<ChangeSequenceOperation>(OperationOf("l", base, Show(right)));
        if (!l || !r) continue;
        RecordingConflictResolver resolver(TheRules(), ResolveBase), naiveResolver(TheRules(), ResolveBase);
        resolver.m_Path = naiveResolver.m_Path = PathOf("l");
        const std::string merged = Describe(MergeSequenceChanges(l, r, resolver, true));
        ASSERT_EQ(merged, NaiveMerge(l, r, naiveResolver)) << "seed " << seed << "\n"
                                                           << base << "\n"
                                                           << Show(left) << "\n"
                                                           << Show(right);
        ASSERT_EQ(Records(resolver), Records(naiveResolver)) << "seed " << seed;
        ++merges;
        conflicts += resolver.HasPendingConflicts();
    }
    EXPECT_GT(merges, 5000);
    EXPECT_GT(conflicts, 100);
}

} // namespace
