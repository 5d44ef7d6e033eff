#pragma once

#include "Values/OvrinObjects.h"

struct TwoFileConfig;
class TimerStat;

namespace ovrin_yaml {
class YAMLMappingDiff;
}

/// Two object files and what makes the left one the right one: the front half of `diff` and `strip`.
struct TwoFiles {
    ovrin_yaml::OvrinObjects left, right;
    const ovrin_yaml::YAMLMappingDiff* diff = nullptr; // points into `right`
};

/// Reads, pre-processes and diffs the files. Throws YAMLError and the standard family.
void ReadAndDiff(TimerStat& root, const TwoFileConfig& config, TwoFiles& files);
