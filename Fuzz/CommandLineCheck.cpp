#include "SmallChecks.h"

#include "CapturedStreams.h"
#include "CommandLine.h"

#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

using Words = std::vector<std::string>;

Words WordsOf(std::string_view input) {
    Words words{"OvrinMerge"};
    while (!input.empty()) {
        const std::size_t end = std::min(input.find('\n'), input.size());
        words.emplace_back(input.substr(0, end));
        input.remove_prefix(std::min(end + 1, input.size()));
    }
    return words;
}

CommandLineArguments Arguments(const Words& words) {
    CommandLineArguments arguments(0, nullptr);
    arguments.args = words;
    return arguments;
}

void AddFlag(Words& words, bool isSet, const char* flag) {
    if (isSet) words.push_back(flag);
}

void AddSharedOptions(Words& words, const TwoFileConfig& config) {
    AddFlag(words, config.timing, "--timing");
    AddFlag(words, !config.useThreads, "--nothreads");
    AddFlag(words, config.headless, "-h");
    words.insert(words.end(), {"--rules", config.rulesFile, "--typeInfo", config.typeInfoFile});
}

Words MergeWordsOf(const MergeConfig& config) {
    Words words{"OvrinMerge", "merge"};
    AddFlag(words, config.premerge, "-p");
    AddFlag(words, config.resolve == ResolveLeft && !config.premerge, "-l");
    AddFlag(words, config.resolve == ResolveRight, "-r");
    AddFlag(words, config.force, "--force");
    AddFlag(words, config.describe, "--describe");
    AddSharedOptions(words, config);
    words.insert(words.end(), {"-i", config.resolveFile, "-o", config.conflictFile, "--fallback",
                               config.fallbackSpecFile});
    words.insert(words.end(), {config.baseFile, config.leftFile, config.rightFile, config.destFile,
                               config.premergeBaseDest, config.premergeRightDest});
    return words;
}

/// The settings as a command line.
Words WordsOf(const Command& command, const MergeConfig& config) {
    if (command.word == "merge") return MergeWordsOf(config);
    Words words{"OvrinMerge", std::string(command.word)};
    AddSharedOptions(words, config);
    words.insert(words.end(), {config.leftFile, config.rightFile, config.destFile});
    return words;
}

std::string Shown(const Words& words) {
    std::string text;
    for (const std::string& word : words) text += "'" + word + "' ";
    return text;
}

/// The words of what the parser accepts; none where it refuses.
Words Accepted(const Command& command, const Words& words) {
    MergeConfig config;
    CommandLineArguments arguments = Arguments(words);
    return ParseArguments(command, arguments, config) ? WordsOf(command, config) : Words();
}

std::string CheckRefusal(const Words& words, const CapturedStreams& streams) {
    CommandLineArguments arguments = Arguments(words);
    const std::size_t before = streams.ErrorSize();
    if (InnerMain(arguments) != ExitStatus::Failed)
        return "refused with another status than that of a failure: " + Shown(words);
    return streams.ErrorSize() > before ? "" : "refused without a word: " + Shown(words);
}

std::string Check(const Command& command, const Words& words, const CapturedStreams& streams) {
    const Words accepted = Accepted(command, words);
    if (accepted.empty()) return CheckRefusal(words, streams);
    const Words again = Accepted(command, accepted);
    return again == accepted ? "" : Shown(accepted) + "is taken for " + Shown(again);
}

} // namespace

std::string CheckCommandLine(std::string_view input) {
    const CapturedStreams streams;
    const Words words = WordsOf(input);
    const std::string word = words.size() > 1 ? words[1] : "";
    const Command* command = FindCommand(word);
    if (command && !command->paths.empty()) return Check(*command, words, streams);
    const bool mayRun = command || (words.size() == 6 && !word.starts_with('-'));
    return mayRun ? "" : CheckRefusal(words, streams);
}

} // namespace ovrin_fuzz
