#include "SelfCheckParts.h"

#include "Fallback.h"

#include "CommandSettings.h"
#include "Diff/DiffContext.h"
#include "Diff/SequenceMatching.h"
#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Merge/OperationMerge.h"
#include "Values/YAMLError.h"

using namespace ovrin_yaml;

namespace self_check {
namespace {

YAMLMapping* CloneOf(const YAMLMapping* mapping) {
    return AsMapping(mapping->Clone());
}

YAMLMapping* UnderTest(YAMLNode* node) {
    YAMLMapping* mapping = YAMLAlloc<YAMLMapping>::create();
    mapping->Append(str("test"), node);
    return mapping;
}

void TestRemoveOperation(TestResults& results) {
    YAMLMapping* mapping = createTestMap();
    YAMLMapping* expected = CloneOf(mapping);
    expected->Remove(str("key2"));
    Removal()->Apply(*mapping, str("key2"));
    results.Add("OperationTest remove operation", EqualContents(mapping, expected));
}

void TestChangeOperation(TestResults& results) {
    YAMLMapping* mapping = createTestMap();
    YAMLMapping* expected = CloneOf(mapping);
    expected->Change(str("key2"), str("changedvalue2"));
    ChangeTo("changedvalue2")->Apply(*mapping, str("key2"));
    results.Add("OperationTest change operation", EqualContents(mapping, expected));
}

void TestChangeMappingOperation(TestResults& results) {
    YAMLMapping* mapping = createTestMap();
    YAMLMapping* expected = CloneOf(mapping);
    expected->Append(str("key4"), str("value4"));
    expected->Remove(str("key2"));
    expected->RebuildHash(false);
    YAMLMapping* outer = UnderTest(mapping);
    const YAMLMappingDiff* diff = YAMLMappingDiff::Diff(NoRules(), mapping, expected);
    YAMLAlloc<ChangeMappingOperation>::create(diff, true)->Apply(*outer, str("test"));
    results.Add("OperationTest change mapping operation", EqualContents(outer, UnderTest(expected)));
}

void TestChangeArrayOperation(TestResults& results) {
    const YAMLSequence* base = SequenceOf({"1"});
    const YAMLSequence* dest = SequenceOf({"2", "1"});
    DiffContext context(NoRules(), {str("test")});
    const YAMLSequenceRemapper* remapper = FindMapping(context, base, dest);
    YAMLMapping* outer = UnderTest(base->Clone());
    if (remapper) {
        const YAMLSequenceDiff* diff =
            YAMLSequenceDiff::Diff(context, remapper->Arrange(base->m_Items), dest->m_Items);
        YAMLAlloc<ChangeSequenceOperation>::create(diff, remapper, true)->Apply(*outer, str("test"));
    }
    results.Add("OperationTest change sequence operation", EqualContents(outer, UnderTest(dest->Clone())));
}

void TestMergeCommands(TestResults& results) {
    const std::string specFile = GetSpecFilename(kDefaultSpecFile);
    results.Add("OperationTest locate merge spec file", !specFile.empty());
    const FallbackCommandMap fallbacks = PopulateFallbacks(specFile);
    results.Add("OperationTest read fallbacks from spec file", !fallbacks.empty());
    for (const auto& [extension, entries] : fallbacks) {
        const std::string name = "OperationTest arg substitution in fallback entry for extn: " +
                                 (extension == "*" ? "asterisk" : extension);
        for (const FallbackCommandEntry& entry : entries)
            results.Add(name, SubstituteMergePlaceholderFilePaths(entry.arguments, "%b", "%l", "%r", "%d") ==
                                  entry.arguments);
    }
}

/// Whether the pair merges to `expected` without a call that its resolver takes for a defect.
bool MergesWithoutConflict(const Operation* left, const Operation* right, const Operation* expected) {
    try {
        ExceptionConflictResolver resolver(NoRules());
        return MergeOperations(left, right, resolver) == expected;
    } catch (const YAMLError&) {
        return false;
    }
}

bool ConflictIsPending(const Operation* left, const Operation* right, ConflictType type) {
    RecordingConflictResolver resolver(NoRules(), ResolveBase);
    MergeOperations(left, right, resolver);
    return VerifyHasConflict(resolver, "", type, ResolveConflict);
}

bool PicksSide(MergeResolve side, const Operation* left, const Operation* right, const Operation* expected) {
    SidePickingConflictResolver resolver(NoRules(), side);
    return MergeOperations(left, right, resolver) == expected;
}

void TestMergeOperation(TestResults& results) {
    const Operation* leftRemove = Removal();
    const Operation* rightRemove = Removal();
    const Operation* leftChange = ChangeTo("newLeftValue");
    const Operation* rightChange = ChangeTo("newRightValue");

    results.Add("OperationTest rm/rm merge operation",
                MergesWithoutConflict(leftRemove, rightRemove, leftRemove));
    results.Add("OperationTest rm/ch merge operation conflicts for left removed and right changed",
                ConflictIsPending(leftRemove, rightChange, ConflictRemoveAgainstChange));
    results.Add("OperationTest ch/rm merge operation",
                MergesWithoutConflict(leftChange, rightRemove, rightRemove));
    results.Add("OperationTest ch/ch merge operation conflicts for both left and right changed",
                ConflictIsPending(leftChange, rightChange, ConflictBothChanges));
    results.Add("OperationTest ch/ch merge operation resolve right",
                PicksSide(ResolveRight, leftChange, rightChange, rightChange));
    results.Add("OperationTest ch/ch merge operation resolve left",
                PicksSide(ResolveLeft, leftChange, rightChange, leftChange));
}

} // namespace

void TestOperations(TestResults& results) {
    TestRemoveOperation(results);
    TestChangeOperation(results);
    TestChangeMappingOperation(results);
    TestChangeArrayOperation(results);
    TestMergeCommands(results);
    TestMergeOperation(results);
}

} // namespace self_check
