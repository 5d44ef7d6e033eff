#include "Merge/OperationMerge.h"
#include "Merge/DiffMerge.h"
#include "Support/Merges.h"

namespace {

using namespace merges;

class OperationMerge : public RulesTest {};

/// Notes each question and answers with the left operation, if there is one.
class AskedResolver final : public ConflictResolver {
public:
    AskedResolver() : ConflictResolver(TheRules()) {}

    std::string asked;
    const Operation* lastLeft = nullptr; // of the last question; the only operation of a one-sided one
    const Operation* lastRight = nullptr;

    const Operation* OnValueAdded(const AddOperation* operation, ConflictType type) override {
        return Note("Added", operation, nullptr, type);
    }
    const Operation* OnValueChanged(const ChangeOperation* operation, ConflictType type) override {
        return Note("Changed", operation, nullptr, type);
    }
    const Operation* OnValueRemoved(const RemoveOperation* operation, ConflictType type) override {
        return Note("Removed", operation, nullptr, type);
    }
    const Operation* OnMappingChanged(const ChangeMappingOperation* operation, ConflictType type) override {
        return Note("Mapping", operation, nullptr, type);
    }
    const Operation* OnSequenceChanged(const ChangeSequenceOperation* operation, ConflictType type) override {
        return Note("List", operation, nullptr, type);
    }
    const Operation* OnSameValueAdded(const AddOperation* left, const AddOperation* right) override {
        return Note("BothAdded", left, right);
    }
    const Operation* OnSameValueChanged(const ChangeOperation* left, const ChangeOperation* right) override {
        return Note("BothChanged", left, right);
    }
    const Operation* OnSameValueChanged(const RemoveOperation* left, const ChangeOperation* right) override {
        return Note("RemovedChanged", left, right);
    }
    const Operation* OnSameValueChanged(const RemoveOperation* left,
                                        const ChangeMappingOperation* right) override {
        return Note("RemovedMapping", left, right);
    }
    const Operation* OnSameValueRemoved(const RemoveOperation* left, const RemoveOperation* right) override {
        return Note("BothRemoved", left, right);
    }
    const Operation* OnSameMappingChanged(const ChangeMappingOperation* left,
                                          const ChangeMappingOperation* right) override {
        return Note("BothMapping", left, right);
    }
    const Operation* OnSameSequenceChanged(const ChangeSequenceOperation* left,
                                           const ChangeSequenceOperation* right) override {
        return Note("BothList", left, right);
    }
    void OnComponentDependencyConflict(const ComponentDependencyConflict&) override {}

private:
    const Operation* Note(const char* question, const Operation* left, const Operation* right,
                          ConflictType type = ConflictNone) {
        asked += (asked.empty() ? "" : " ") +
                 (m_Path.Elements().empty() ? "" : PathToString(m_Path.Elements()) + ":") + question;
        if (type != ConflictNone) asked += IsLeftSide(type) ? "<" : ">";
        lastLeft = left;
        lastRight = right;
        return left;
    }
};

/// One operation of each kind, none first.
std::vector<const Operation*> OneOfEach() {
    return {nullptr,
            OperationOf("a", "1", ""),
            OperationOf("a", "1", "2"),
            OperationOf("a", "", "1"),
            OperationOf("a", "x: 1", "x: 2"),
            OperationOf("a", "[1]", "[2]")};
}

TEST_F(OperationMerge, EveryPairAsksItsOneQuestion) {
    // Left down the side, right across, in the order of OneOfEach; "<" and ">" tell the side that is asked
    // about.
    const char* const expected[6][6] = {
        {"", "Removed>", "Changed>", "Added>", "Mapping>", "List>"},
        {"Removed<", "BothRemoved", "RemovedChanged", "Removed<", "RemovedMapping", "Removed<"},
        {"Changed<", "Removed>", "BothChanged", "Changed<", "Changed<", "Changed<"},
        {"Added<", "Removed>", "Changed>", "BothAdded", "Added<", "Added<"},
        {"Mapping<", "Removed>", "Changed>", "Added>", "BothMapping", "Mapping<"},
        {"List<", "Removed>", "Changed>", "Added>", "Mapping>", "BothList"}};
    const auto lefts = OneOfEach(), rights = OneOfEach();
    for (std::size_t l = 0; l < 6; ++l) {
        for (std::size_t r = 0; r < 6; ++r) {
            AskedResolver resolver;
            const Operation* result = MergeOperations(lefts[l], rights[r], resolver);
            EXPECT_EQ(resolver.asked, expected[l][r]) << l << " " << r;
            EXPECT_EQ(result, resolver.lastLeft);
            const bool right = resolver.asked.ends_with('>');
            EXPECT_EQ(resolver.lastLeft, right ? rights[r] : lefts[l]) << l << " " << r;
            const bool both = !resolver.asked.empty() && !resolver.asked.ends_with('<') && !right;
            EXPECT_EQ(resolver.lastRight, both ? rights[r] : nullptr) << l << " " << r;
        }
    }
}

/// The questions of the merge of two diffs, with their paths.
std::string Questions(const std::string& base, const std::string& left, const std::string& right) {
    AskedResolver resolver;
    MergeMappingDiffs(DiffOf(base, left), DiffOf(base, right), resolver);
    EXPECT_TRUE(resolver.m_Path.Elements().empty());
    return resolver.asked;
}

TEST_F(OperationMerge, KeysAreAskedForInTheOrderOfTheLeftDiff) {
    EXPECT_EQ(Questions("", "", ""), "");
    EXPECT_EQ(Questions("a: 1\nb: 1", "a: 1\nb: 1", "a: 1\nb: 1"), "");
    EXPECT_EQ(Questions("a: 1\nb: 1\nc: 1\nd: 1", "a: 1\nb: 1\nc: 2\nd: 2", "a: 2\nb: 2\nc: 1\nd: 2"),
              "c:Changed< a:Changed> d:BothChanged b:Changed>");
}

TEST_F(OperationMerge, TheKeyOrderIsMergedUnderAPathOfItsOwnAheadOfTheKeys) {
    EXPECT_EQ(Questions("a: 1", "a: 1\nb: 1", "c: 1\na: 1"), "_.0:Added> _.2:Added< b:Added< c:Added>");
    EXPECT_EQ(Questions("a: 1", "a: 1\nb: 1", "a: 1\nb: 1"), "_.1:BothAdded _.1:Added< b:BothAdded");
}

TEST_F(OperationMerge, OneSidesKeyOrderIsTakenWhereTheOtherHasNone) {
    AskedResolver resolver;
    const YAMLMappingDiff none;
    const YAMLMappingDiff* moved = DiffOf("a: 1\nb: 2", "b: 2\na: 1");
    EXPECT_EQ(MergeMappingDiffs(moved, &none, resolver)->m_KeyOrder, moved->m_KeyOrder);
    EXPECT_EQ(MergeMappingDiffs(&none, moved, resolver)->m_KeyOrder, moved->m_KeyOrder);
    EXPECT_EQ(MergeMappingDiffs(&none, &none, resolver)->m_KeyOrder, nullptr);
}

} // namespace
