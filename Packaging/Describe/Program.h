#pragma once

#include <string>
#include <string_view>
#include <vector>

/// What an argument may be, for completion.
struct Values {
    enum class More { None, Files, Revisions, RevisionsAndFiles };

    std::vector<std::string> words; // some, or all there are
    More more = More::None;         // what else there is
};

struct DescribedOption {
    std::vector<std::string> words; // such as -o and --output; the first is the most descriptive
    std::string value;              // what the argument behind it is; empty: it stands alone
    std::string meaning;            // one line
    bool isRepeated = false;
    Values values;
};

struct Operand {
    std::string name;
    bool isRequired = false;
    bool isRepeated = false; // the last one only
    Values values;
};

struct DescribedCommand {
    std::string name;
    std::string meaning; // one line
    std::vector<DescribedOption> options;
    std::vector<Operand> operands;
};

/// A program as it stands on the command line.
struct DescribedProgram {
    std::string name;
    std::vector<DescribedOption> options; // those that stand in place of a command
    std::vector<DescribedCommand> commands;
    bool isPlain = false; // its options end at the first operand, and a value is an argument of its own
};

/// The words of options with or without a value, with blanks between.
std::string OptionWords(const std::vector<DescribedOption>& options, bool withValue);

/// Such as -l or --fallback FILE.
std::string Form(const DescribedOption& option);

std::string Joined(const std::vector<std::string>& words, std::string_view between);

/// `text`, with what stands for each of the characters: Escaped("it's", "'", "'\\''") is it'\''s. In the
/// replacement, & is the character.
std::string Escaped(std::string_view text, std::string_view characters, std::string_view replacement);

/// What a shell calls to list the revisions of a repository, one to a line.
constexpr std::string_view kListRevisions = "git for-each-ref --format=%\\(refname:short\\) 2>/dev/null";
