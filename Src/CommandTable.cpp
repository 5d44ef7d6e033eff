#include "CommandTable.h"

#include "DiffCommand.h"
#include "MergeCommand.h"
#include "SelfCheck.h"
#include "StripCommand.h"

#include <algorithm>

using namespace ovrin_yaml;

namespace {

template <auto kFlag, bool kValue = true> std::string_view Sets(MergeConfig& settings, std::string&) {
    settings.*kFlag = kValue;
    return {};
}

template <auto kField> std::string_view Stores(MergeConfig& settings, std::string& value) {
    settings.*kField = std::move(value);
    return {};
}

/// Once only, whichever side it is.
template <MergeResolve kSide, bool kPremerge = false>
std::string_view Resolves(MergeConfig& settings, std::string&) {
    if (settings.resolve != ResolveBase) return "Error: Only one of then -l, -r and -p may be provided";
    settings.resolve = kSide;
    settings.premerge = kPremerge;
    return {};
}

constexpr Option kMergeOptions[] = {
    {"-l", "", "at open conflicts take the left value (theirs) instead of that of the base; they stay open",
     true, "", Resolves<ResolveLeft>},
    {"-r", "", "the same with the right value (mine)", true, "", Resolves<ResolveRight>},
    {"-p", "", "as -l, and premerge the other two files for an external tool", true, "",
     Resolves<ResolveLeft, true>},
    {"-i", "FILE", "decisions that settle conflicts", true, "", Stores<&MergeConfig::resolveFile>},
    {"-o", "FILE", "where the report goes; standard output otherwise", true, "",
     Stores<&MergeConfig::conflictFile>},
    {"--describe", "", "report also what was merged without a question", true, "",
     Sets<&MergeConfig::describe>},
    {"--fallback", "FILE", "which external tools to use; none for no tool", true, "none",
     Stores<&MergeConfig::fallbackSpecFile>},
    {"--force", "", "merge whatever the extension of the file", true, "", Sets<&MergeConfig::force>},
};

constexpr Option kSharedOptions[] = {
    {"--rules", "FILE", "merge rules instead of the factory file mergerules.txt", true, "",
     Stores<&MergeConfig::rulesFile>},
    {"--typeInfo", "FILE", "type information for the check of component dependencies", true, "",
     Stores<&MergeConfig::typeInfoFile>},
    {"--timing", "", "print the time of each stage", false, "", Sets<&MergeConfig::timing>},
    {"--nothreads", "", "read and diff without threads", false, "", Sets<&MergeConfig::useThreads, false>},
    {"-h", "", "without effect", true, "", Sets<&MergeConfig::headless>},
};

constexpr PathArgument kMergePaths[] = {
    {"BASE", &MergeConfig::baseFile},
    {"LEFT", &MergeConfig::leftFile},
    {"RIGHT", &MergeConfig::rightFile},
    {"DEST", &MergeConfig::destFile},
    {"PREMERGED_BASE", &MergeConfig::premergeBaseDest},
    {"PREMERGED_RIGHT", &MergeConfig::premergeRightDest},
};

constexpr PathArgument kTwoFilePaths[] = {
    {"LEFT", &MergeConfig::leftFile},
    {"RIGHT", &MergeConfig::rightFile},
    {"DEST", &MergeConfig::destFile},
};

ExitStatus RunDiff(MergeConfig& settings) {
    DiffConfig config{static_cast<const TwoFileConfig&>(settings)};
    return HandleDiffCommand(config);
}

ExitStatus RunStrip(MergeConfig& settings) {
    StripConfig config{static_cast<const TwoFileConfig&>(settings)};
    return HandleStripCommand(config);
}

ExitStatus RunSelfCheck(MergeConfig&) {
    return RunUnitttests();
}

constexpr Command kCommandTable[] = {
    {"merge",
     "merge the changes from BASE to LEFT with those from BASE to RIGHT",
     true,
     {kMergeOptions, kSharedOptions},
     kMergePaths,
     3,
     ProcessMergeCommand},
    {"diff", "list the changes from LEFT to RIGHT", true, {kSharedOptions}, kTwoFilePaths, 2, RunDiff},
    {"strip",
     "write RIGHT, reduced to what differs from LEFT",
     true,
     {kSharedOptions},
     kTwoFilePaths,
     2,
     RunStrip},
    {"unittest", "let the program check itself", false, {}, {}, 0, RunSelfCheck},
};

/// Meanings stand between the quotes and brackets of shells as they are.
constexpr bool IsPlain(std::string_view meaning) {
    return meaning.find_first_of("'\"\\:[]|$`") == std::string_view::npos;
}
static_assert(std::ranges::all_of(kMergeOptions, IsPlain, &Option::meaning));
static_assert(std::ranges::all_of(kSharedOptions, IsPlain, &Option::meaning));
static_assert(std::ranges::all_of(kCommandTable, IsPlain, &Command::meaning));

} // namespace

const std::span<const Command> kCommands = kCommandTable;

const Command* FindCommand(std::string_view word) {
    const auto found = std::ranges::find(kCommands, word, &Command::word);
    return found == kCommands.end() ? nullptr : &*found;
}

const Option* FindOption(const Command& command, std::string_view word) {
    for (const std::span<const Option> options : command.options)
        for (const Option& option : options)
            if (option.word == word) return &option;
    return nullptr;
}
