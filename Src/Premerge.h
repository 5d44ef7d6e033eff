#pragma once

#include "Diff/MergeRules.h"
#include "Diff/YAMLMappingDiff.h"
#include "Values/OvrinObjects.h"

struct MergeConfig;
class TimerStat;

/// What both premerge passes work on. They share all but the base read-only.
struct PremergeInputs {
    const ovrin_yaml::MergeRules& rules;
    ovrin_yaml::OvrinObjects& base; // as it was before the merge; used up
    const ovrin_yaml::YAMLMapping& left;
    const ovrin_yaml::YAMLMapping& right;
    const ovrin_yaml::YAMLMappingDiff* leftDiff;
    const ovrin_yaml::YAMLMappingDiff* rightDiff;
};

/// The errno of the first failure to write each file; 0 for none.
struct PremergeErrors {
    int base = 0;
    int right = 0;
};

/// Writes the premerged base and the premerged right file, which hold all that could be merged and, at the
/// open conflicts, the value of the base (or blanks, where the rules want them) and of the right side.
/// Decisions of a resolve file don't count here. The passes run beside each other, each to its end; then the
/// first failure in this order is thrown. What can't be written is returned.
PremergeErrors PremergeBoth(TimerStat& root, const MergeConfig& config, const PremergeInputs& inputs);
