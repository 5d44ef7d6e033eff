#include "Diff/MergeTreeCloneVisitor.h"
#include "Diff/OperationComparison.h"
#include "Support/Diffs.h"

namespace {

using namespace diffs;

class OperationEquality : public RulesTest {};

/// Whether the changes of two sides to one base are the same change.
bool Same(const std::string& base, const std::string& left, const std::string& right) {
    const Operation *l = OperationOf("a", base, left), *r = OperationOf("a", base, right);
    EXPECT_EQ(OperationEquals(l, r), OperationEquals(r, l));
    return OperationEquals(l, r);
}

TEST_F(OperationEquality, IsThatOfTheWholeChange) {
    const std::tuple<const char*, const char*, const char*, bool> cases[] = {
        {"1", "2", "2", true},
        {"1", "2", "3", false},
        {"1", "", "", true},
        {"1", "", "2", false},
        {"", "{x: 1, y: 2}", "{x: 1, y: 2}", true},
        {"", "{x: 1, y: 2}", "{y: 2, x: 1}", false}, // the hash covers the order
        {"x: 1", "x: 2", "x: 2", true},
        {"x: 1", "x: 2", "x: 3", false},
        {"x: 1", "x: 2", "x: 1\ny: 2", false},
        {"x: 1\ny: 1", "x: 2", "x: 2", true},
        {"x: 1\ny: 1", "x: 2\ny: 1", "y: 1\nx: 2", false}, // the same entry, another order
        {"x: 1", "x: 1\ny: 2\nz: 3", "x: 1\nz: 3\ny: 2", false},
        {"[1, 2]", "[2, 1]", "[2, 1]", true},
        {"[1, 2]", "[2, 1]", "[2]", false},
        {"[1]", "[1, 2]", "[1, 3]", false},
        {"[1]", "[1, 2]", "[2, 1]", false},
        {"[1]", "[1, {a: 1}]", "[1, {a: 1}]", true}};
    for (const auto& [base, left, right, same] : cases)
        EXPECT_EQ(Same(base, left, right), same) << left << right;
}

TEST_F(OperationEquality, KindsDifferAndTheMergeFlagDoesNotCount) {
    const YAMLNode* value = Node("1");
    EXPECT_FALSE(OperationEquals(YAMLAlloc<ChangeOperation>::create(value),
                                 YAMLAlloc<AddOperation>::create(value, false)));
    EXPECT_TRUE(OperationEquals(YAMLAlloc<AddOperation>::create(value, true),
                                YAMLAlloc<AddOperation>::create(value, false)));
    EXPECT_TRUE(
        OperationEquals(YAMLAlloc<RemoveOperation>::create(true), YAMLAlloc<RemoveOperation>::create(false)));
}

TEST_F(OperationEquality, TheKindOfMatchingCounts) {
    YAMLSequenceDiff none;
    YAMLSequenceRemapper byKey(2, 2, true), byEquality(2, 2, false), longer(2, 3, true);
    const ChangeSequenceOperation first(&none, &byKey, true);
    EXPECT_TRUE(OperationEquals(&first, MergeTreeCloneVisitor::Clone(&first)));
    for (const YAMLSequenceRemapper* other :
         {&byEquality, &longer, static_cast<YAMLSequenceRemapper*>(nullptr)}) {
        const ChangeSequenceOperation second(&none, other, true);
        EXPECT_FALSE(OperationEquals(&first, &second));
    }
}

const char* const kBase = "a: 1\nb: [1, {x: 1}]\nc:\n  d: 1\n  e: 2\nz: 0";
const char* const kDest = "c:\n  e: 3\n  d: [{f: g}, 5]\nb: [{x: 1}, y]\nn: {p: {q: 1}}";

TEST_F(OperationEquality, ACopyEqualsItsSourceAndSharesNothing) {
    const Operation* source = OperationOf("", kBase, kDest);
    const Operation* copy = MergeTreeCloneVisitor::Clone(source);
    EXPECT_TRUE(OperationEquals(source, copy));
    const auto inside = [](const Operation* operation, const char* key) {
        return As<ChangeMappingOperation>(operation)->m_Diff->Find(YAMLScalar::Lookup(key));
    };
    const auto *list = As<ChangeSequenceOperation>(inside(source, "b")),
               *other = As<ChangeSequenceOperation>(inside(copy, "b"));
    EXPECT_NE(list->m_Remapper, other->m_Remapper);
    EXPECT_NE(list->m_Diff, other->m_Diff);
    EXPECT_NE(As<AddOperation>(inside(source, "n"))->m_Value, As<AddOperation>(inside(copy, "n"))->m_Value);
}

TEST_F(OperationEquality, ABlankCopyHasTheShapeAlone) {
    const Operation* source = OperationOf("", kBase, kDest);
    const std::string before = Describe(source);
    EXPECT_EQ(
        Describe(MergeTreeCloneVisitor::CloneBlank(source)),
        " (a delete; b [-1 0 ~>2: 1 add ]; c (d change [{f: }, ]; e change ); z delete; n add {p: {q: }})");
    EXPECT_EQ(Describe(source), before);
    EXPECT_EQ(Describe(MergeTreeCloneVisitor::CloneBlank(OperationOf("", "1", "2"))), " change ");
}

} // namespace
