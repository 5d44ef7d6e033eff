#include "SelfCheck.h"

#include "SelfCheckParts.h"

#include "Values/YAMLError.h"

#include <algorithm>
#include <iostream>

using namespace ovrin_yaml;

namespace self_check {

YAMLScalar* str(const char* text) {
    return YAMLScalar::Lookup(text);
}

YAMLMapping* MapOf(std::initializer_list<std::pair<const char*, const char*>> pairs) {
    YAMLMapping* mapping = YAMLAlloc<YAMLMapping>::create();
    for (const auto& [key, value] : pairs) mapping->Append(str(key), str(value));
    mapping->RebuildHash(false);
    return mapping;
}

YAMLSequence* SequenceOf(std::initializer_list<const char*> items) {
    YAMLSequence* sequence = YAMLAlloc<YAMLSequence>::create();
    for (const char* item : items) sequence->Append(str(item));
    sequence->RebuildHash(false);
    return sequence;
}

YAMLMapping* createTestMap() {
    return MapOf({{"key1", "value1"}, {"key2", "value2"}, {"key3", "value3"}});
}

const MergeRules& NoRules() {
    static const MergeRules rules;
    return rules;
}

const RemoveOperation* Removal() {
    return YAMLAlloc<RemoveOperation>::create(false);
}

const ChangeOperation* ChangeTo(const char* value) {
    return YAMLAlloc<ChangeOperation>::create(str(value));
}

bool EqualContents(YAMLNode* a, YAMLNode* b) {
    a->RebuildHash(false);
    b->RebuildHash(false);
    return a->Equals(b);
}

bool VerifyHasConflict(const RecordingConflictResolver& resolver, const std::string& path, ConflictType type,
                       MergeResolve resolve) {
    const auto& records = resolver.Records();
    const auto record = std::find_if(records.begin(), records.end(), [&](const auto& candidate) {
        return PathToString(candidate.path) == path;
    });
    return record != records.end() && record->type == type && record->resolve == resolve;
}

} // namespace self_check

int RunUnitttests() {
    try {
        TestResults results;
        self_check::TestOperations(results);
        self_check::TestDiffs(results);
        results.Output(std::cout);
        return 0;
    } catch (const YAMLError& error) {
        std::cerr << "YAML error: " << error.what() << '\n';
    } catch (const std::exception& error) {
        std::cerr << "Exception: " << error.what() << '\n';
    }
    return 1;
}
