#pragma once

struct TwoFileConfig;
class TimerStat;

namespace ovrin_yaml {
class MergeSession;
}

/// Reads, pre-processes and diffs two object files, the front half of `diff` and `strip`: a session in which
/// the left file plays the base and the right one the left side. Throws YAMLError, no MergeError, and the
/// standard family.
void ReadAndDiff(TimerStat& root, const TwoFileConfig& config, ovrin_yaml::MergeSession& session);
