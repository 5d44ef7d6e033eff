#pragma once

#include "Diff/MergeRules.h"
#include "Diff/Operation.h"
#include "Merge/RecordingConflictResolver.h"
#include "TestResults.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <initializer_list>
#include <string>
#include <utility>

/// The parts of the built-in self check, and what they share. The trees, diffs and operations of a check live
/// until the process ends.
namespace self_check {

void TestOperations(TestResults& results);
void TestDiffs(TestResults& results);

ovrin_yaml::YAMLScalar* str(const char* text);
/// Containers of scalars, hashed.
ovrin_yaml::YAMLMapping* MapOf(std::initializer_list<std::pair<const char*, const char*>> pairs);
ovrin_yaml::YAMLSequence* SequenceOf(std::initializer_list<const char*> items);
/// key1: value1, key2: value2, key3: value3.
ovrin_yaml::YAMLMapping* createTestMap();

/// Those of an empty rules file.
const ovrin_yaml::MergeRules& NoRules();

const ovrin_yaml::RemoveOperation* Removal();
const ovrin_yaml::ChangeOperation* ChangeTo(const char* value);

/// Rebuilds both hashes first.
bool EqualContents(ovrin_yaml::YAMLNode* a, ovrin_yaml::YAMLNode* b);

/// Whether the first record of that path has the given type and was settled that way.
bool VerifyHasConflict(const ovrin_yaml::RecordingConflictResolver& resolver, const std::string& path,
                       ovrin_yaml::ConflictType type, ovrin_yaml::MergeResolve resolve);

} // namespace self_check
