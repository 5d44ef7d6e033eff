#include "SelfCheckParts.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Merge/DiffMerge.h"

using namespace ovrin_yaml;

namespace self_check {
namespace {

const YAMLMappingDiff* LeftDiff() {
    YAMLMappingDiff* diff = YAMLAlloc<YAMLMappingDiff>::create();
    diff->Add(str("key2"), Removal());
    diff->Add(str("key3"), ChangeTo("newvalue3left"));
    diff->Add(str("key4"), YAMLAlloc<AddOperation>::create(str("newvalue4left"), false));
    return diff;
}

const YAMLMappingDiff* RightDiff() {
    YAMLMappingDiff* diff = YAMLAlloc<YAMLMappingDiff>::create();
    diff->Add(str("key1"), Removal());
    diff->Add(str("key2"), ChangeTo("newvalue2"));
    diff->Add(str("key3"), ChangeTo("newvalue3right"));
    return diff;
}

/// The test map with both diffs merged into it.
YAMLMapping* MergeIntoTestMap(ConflictResolver& resolver) {
    YAMLMapping* mapping = createTestMap();
    MergeMappingDiffs(LeftDiff(), RightDiff(), resolver)->Apply(*mapping);
    return mapping;
}

void TestLeftDiffApply(TestResults& results) {
    YAMLMapping* mapping = createTestMap();
    YAMLMapping* expected = createTestMap();
    expected->Remove(str("key2"));
    expected->Change(str("key3"), str("newvalue3left"));
    expected->Insert(str("key4"), str("newvalue4left"));
    LeftDiff()->Apply(*mapping);
    results.Add("DiffTest mapping diff apply", EqualContents(mapping, expected));
}

void TestMergeWithConflicts(TestResults& results) {
    const std::string name = "DiffTest mapping merge and diff apply";
    RecordingConflictResolver resolver(NoRules(), ResolveBase);
    YAMLMapping* mapping = MergeIntoTestMap(resolver);
    // The base value stands wherever a conflict is pending.
    YAMLMapping* expected = MapOf({{"key2", "value2"}, {"key3", "value3"}, {"key4", "newvalue4left"}});
    results.Add(name, EqualContents(mapping, expected));
    results.Add(name + " has records", !resolver.Records().empty());
    results.Add(name + " has conflicts for left remove and right changed",
                VerifyHasConflict(resolver, "key2", ConflictRemoveAgainstChange, ResolveConflict));
    results.Add(name + " has conflicts for both left and right changed",
                VerifyHasConflict(resolver, "key3", ConflictBothChanges, ResolveConflict));
}

void TestMergeWithDecisions(TestResults& results) {
    const std::string name = "DiffTest mapping merge and diff apply";
    RecordingConflictResolver resolver(NoRules(), ResolveBase);
    resolver.SetResolveMethodForPaths({{{str("key2")}, ResolveLeft}, {{str("key3")}, ResolveLeft}});
    YAMLMapping* mapping = MergeIntoTestMap(resolver);
    YAMLMapping* expected = MapOf({{"key3", "newvalue3left"}, {"key4", "newvalue4left"}});
    results.Add(name + "(2)", EqualContents(mapping, expected));
    results.Add(name + " has no conflicts with handling doc", !resolver.HasPendingConflicts());
}

void TestMergeOfRightSide(TestResults& results) {
    SidePickingConflictResolver resolver(NoRules(), ResolveRight);
    YAMLMapping* mapping = MergeIntoTestMap(resolver);
    YAMLMapping* expected =
        MapOf({{"key2", "newvalue2"}, {"key3", "newvalue3right"}, {"key4", "newvalue4left"}});
    results.Add("DiffTest mapping merge and diff apply auto resolve", EqualContents(mapping, expected));
}

void TestMapDiffApply(TestResults& results) {
    TestLeftDiffApply(results);
    TestMergeWithConflicts(results);
    TestMergeWithDecisions(results);
    TestMergeOfRightSide(results);
}

void TestMapDiffCreate(TestResults& results) {
    YAMLMapping* base = createTestMap();
    YAMLMapping* left = MapOf({{"key1", "value1"}, {"key3", "value3new"}, {"key4", "value4"}});
    const YAMLMappingDiff* diff = YAMLMappingDiff::Diff(NoRules(), base, left);
    results.Add("DiffTest mapping diff kept key1", !diff->HasKey(str("key1")));
    results.Add("DiffTest mapping diff removed key2", diff->HasKey(str("key2")));
    results.Add("DiffTest mapping diff changed key3", diff->HasKey(str("key3")));
    results.Add("DiffTest mapping diff added key4", diff->HasKey(str("key4")));
    results.Add("DiffTest mapping base and left not equal before applying diff", !EqualContents(base, left));
    diff->Apply(*base);
    results.Add("DiffTest mapping base and left are equal after applying diff", EqualContents(base, left));
}

bool HasKeyAt(const YAMLSequenceDiff* diff, std::size_t position, int key) {
    return position < diff->Entries().size() && diff->Entries()[position].index == key;
}

bool HasValue(const ValuedOperation* operation, const char* value) {
    return operation->m_Value == str(value);
}

void TestAppendedElement(TestResults& results) {
    const YAMLSequenceDiff* diff = YAMLSequenceDiff::Diff(NoRules(), SequenceOf({}), SequenceOf({"1"}));
    const AddOperation* add = As<AddOperation>(diff->Find(0));
    results.Add("DiffTest sequence diff append 1 size is 1", diff->Entries().size() == 1);
    results.Add("DiffTest sequence diff append 1 key is 0", HasKeyAt(diff, 0, 0));
    results.Add("DiffTest sequence diff append 1 op is change", add != nullptr);
    if (add) results.Add("DiffTest sequence diff append 1 value is 1", HasValue(add, "1"));
}

void TestRemovedElement(TestResults& results) {
    const YAMLSequenceDiff* diff = YAMLSequenceDiff::Diff(NoRules(), SequenceOf({"1"}), SequenceOf({}));
    results.Add("DiffTest sequence diff remove 1 size is 1", diff->Entries().size() == 1);
    results.Add("DiffTest sequence diff remove 1 key is 0", HasKeyAt(diff, 0, 0));
    results.Add("DiffTest sequence diff remove 1 op is remove",
                As<RemoveOperation>(diff->Find(0)) != nullptr);
}

void TestChangedAndRemovedElements(TestResults& results) {
    const YAMLSequenceDiff* diff =
        YAMLSequenceDiff::Diff(NoRules(), SequenceOf({"2", "3"}), SequenceOf({"1"}));
    const ChangeOperation* change = As<ChangeOperation>(diff->Find(0));
    results.Add("DiffTest sequence diff remove/change 2 size is 2", diff->Entries().size() == 2);
    results.Add("DiffTest sequence diff remove/change 2 key is 0", HasKeyAt(diff, 0, 0));
    results.Add("DiffTest sequence diff remove/change 2 key is 1", HasKeyAt(diff, 1, 1));
    if (change) results.Add("DiffTest sequence diff remove/change 2 value is 1", HasValue(change, "1"));
    results.Add("DiffTest sequence diff remove/change 2 op is remove",
                As<RemoveOperation>(diff->Find(1)) != nullptr);
}

void TestArrayDiff(TestResults& results) {
    TestAppendedElement(results);
    TestRemovedElement(results);
    TestChangedAndRemovedElements(results);
}

} // namespace

void TestDiffs(TestResults& results) {
    TestMapDiffApply(results);
    TestMapDiffCreate(results);
    TestArrayDiff(results);
}

} // namespace self_check
