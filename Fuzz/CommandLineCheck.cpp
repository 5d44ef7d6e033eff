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

/// The settings as a command line.
Words WordsOf(const MergeConfig& config) {
    Words words{"OvrinMerge", "merge"};
    AddFlag(words, config.premerge, "-p");
    AddFlag(words, config.resolve == ResolveLeft && !config.premerge, "-l");
    AddFlag(words, config.resolve == ResolveRight, "-r");
    AddFlag(words, config.force, "--force");
    AddFlag(words, config.describe, "--describe");
    AddFlag(words, config.timing, "--timing");
    AddFlag(words, !config.useThreads, "--nothreads");
    AddFlag(words, gHeadlessEnabled, "-h");
    words.insert(words.end(),
                 {"-i", config.resolveFile, "-o", config.conflictFile, "--rules", config.rulesFile,
                  "--typeInfo", config.typeInfoFile, "--fallback", config.fallbackSpecFile});
    words.insert(words.end(), {config.baseFile, config.leftFile, config.rightFile, config.destFile,
                               config.premergeBaseDest, config.premergeRightDest});
    return words;
}

Words WordsOf(const TwoFileConfig& config, const char* command) {
    Words words{"OvrinMerge", command};
    AddFlag(words, config.timing, "--timing");
    AddFlag(words, !config.useThreads, "--nothreads");
    AddFlag(words, gHeadlessEnabled, "-h");
    words.insert(words.end(), {"--rules", config.rulesFile, "--typeInfo", config.typeInfoFile});
    words.insert(words.end(), {config.leftFile, config.rightFile, config.destFile});
    return words;
}

Words WordsOf(const DiffConfig& config) {
    return WordsOf(config, "diff");
}

Words WordsOf(const StripConfig& config) {
    return WordsOf(config, "strip");
}

std::string Shown(const Words& words) {
    std::string text;
    for (const std::string& word : words) text += "'" + word + "' ";
    return text;
}

/// The words of what a parser accepts; none where it refuses.
template <class Config>
Words Accepted(bool (&parse)(CommandLineArguments&, int, Config&), const Words& words) {
    gHeadlessEnabled = false;
    Config config;
    CommandLineArguments arguments = Arguments(words);
    return parse(arguments, 2, config) ? WordsOf(config) : Words();
}

std::string CheckRefusal(const Words& words, const CapturedStreams& streams) {
    CommandLineArguments arguments = Arguments(words);
    const std::size_t before = streams.ErrorSize();
    if (InnerMain(arguments) != ExitStatus::Failed)
        return "refused with another status than that of a failure: " + Shown(words);
    return streams.ErrorSize() > before ? "" : "refused without a word: " + Shown(words);
}

template <class Config>
std::string Check(bool (&parse)(CommandLineArguments&, int, Config&), const Words& words,
                  const CapturedStreams& streams) {
    const Words accepted = Accepted(parse, words);
    if (accepted.empty()) return CheckRefusal(words, streams);
    const Words again = Accepted(parse, accepted);
    return again == accepted ? "" : Shown(accepted) + "is taken for " + Shown(again);
}

} // namespace

std::string CheckCommandLine(std::string_view input) {
    const CapturedStreams streams;
    const Words words = WordsOf(input);
    const std::string command = words.size() > 1 ? words[1] : "";
    if (command == "merge") return Check(ParseMergeArgs, words, streams);
    if (command == "diff") return Check(ParseDiffArgs, words, streams);
    if (command == "strip") return Check(ParseStripArgs, words, streams);
    const bool mayRun = command == "unittest" || (words.size() == 6 && !command.starts_with('-'));
    return mayRun ? "" : CheckRefusal(words, streams);
}

} // namespace ovrin_fuzz
