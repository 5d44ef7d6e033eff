#pragma once

struct MergeConfig;
class TimerStat;

namespace ovrin_yaml {
class MergeSession;
}

/// The errno of the first failure to write each file; 0 for none.
struct PremergeErrors {
    int base = 0;
    int right = 0;
};

/// Writes the premerged base and the premerged right file, which hold all that could be merged and, at the
/// open conflicts, the value of the base (or blanks, where the rules want them) and of the right side.
/// Decisions of a resolve file don't count here. The session must have kept its base. The passes run beside
/// each other, each to its end; then the first failure in this order is thrown. What can't be written is
/// returned.
PremergeErrors PremergeBoth(TimerStat& root, const MergeConfig& config, ovrin_yaml::MergeSession& session);
