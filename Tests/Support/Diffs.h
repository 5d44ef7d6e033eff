#pragma once

#include "Diff/CheckDiff.h"
#include "Diff/MergeRules.h"
#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"
#include "Support/Documents.h"

#include <gtest/gtest.h>

/// Diffs on one line:
///
///     a change 2                  operations of a mapping, in their order, joined by "; "
///     a add {b: 1}; c delete
///     a (b change 2)              a mapping changes inside
///     a [1 -1 0 >3: 2 add x]      a list changes inside: moves, destination count, operations by index;
///     a [=: 0 (b change 2)]       "=" where nothing moves, "~" ahead of ">" where the match was by equality
///     a! delete                   "!" marks what is not mergeable, changes apart
namespace diffs {

using namespace documents;

/// The rules of the test under way: those of RulesTest::Rules, or no more than the default keys.
MergeRules& TheRules();

std::string Describe(const Operation* operation);
std::string Describe(const YAMLSequenceRemapper* remapper);
std::string Describe(const YAMLSequenceDiff* diff);
/// The operations; the key order, the identity left out, in front as "keys [...] " if asked for.
std::string Describe(const YAMLMappingDiff* diff, bool withKeyOrder = false);

inline const YAMLMappingDiff* DiffOf(const std::string& base, const std::string& dest) {
    const YAMLMappingDiff* diff = YAMLMappingDiff::Diff(TheRules(), Doc(base), Doc(dest));
    EXPECT_EQ(CheckDiff(*diff, DiffOrigin::Trees), "");
    return diff;
}
/// One operation, from one text to another at a path.
const Operation* OperationOf(const std::string& path, const std::string& base, const std::string& dest);

/// Tests that may have rules of their own.
class RulesTest : public testing::Test {
protected:
    RulesTest() { TheRules() = {}; }
    /// In place of earlier ones.
    static void Rules(const std::string& text);
};

} // namespace diffs
