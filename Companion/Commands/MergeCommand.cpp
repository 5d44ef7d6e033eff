#include "Commands/MergeCommand.h"

#include "Commands/FileMerge.h"
#include "Names/PrintableText.h"
#include "Words/Failure.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <new>
#include <utility>

namespace ovrin {

namespace {

constexpr std::size_t kWordsOfSubversion = 5;

/// What ends a merge names its scene, and what becomes of that.
Outcome MergeOrTell(const FileMerge& files) {
    try {
        return Merge(files);
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        throw Failure(
            Printable(files.path) + " is not merged: " + error.what() +
            "\nIt stays unmerged, and nothing was changed: put a good version in its place, and tell "
            "version control that it is settled.");
    }
}

} // namespace

Action DescribeMerge(CLI::App& command) {
    auto files = std::make_shared<FileMerge>();
    files->format = FormatFiles::OfEnvironment();
    command.add_option("--base-label", files->labels.base, "What the base is, for messages: a commit");
    command.add_option("--our-label", files->labels.ours, "What ours is: a branch or commit");
    command.add_option("--their-label", files->labels.theirs, "What theirs is: a branch or commit");
    command.add_option("--rules", files->format.rules,
                       "The merge rules, instead of those beside the program");
    command.add_option("--typeInfo", files->format.typeInfo, "What is known of the types of components");
    command.add_option("BASE", files->base, "The common ancestor; empty if there is none")->required();
    command.add_option("OURS", files->ours, "The scene as it is here")->required();
    command.add_option("THEIRS", files->theirs, "The scene as it comes in")->required();
    command.add_option("RESULT", files->result, "Where the merged scene goes; may be one of the others")
        ->required();
    command.add_option("PATH", files->path, "The scene's path in the working tree")->required();
    command.footer(
        "Open conflicts take ours, or what OVRIN_TAKE or the setting ovrin.take says. The status is "
        "0 once all is settled, 1 if conflicts are open, 2 if the scene could not be merged.");
    return [files] { return MergeOrTell(*files); };
}

std::vector<std::string> ArgumentsFor(const std::string& program, std::vector<std::string> words) {
    if (program.substr(program.rfind('/') + 1) != "ovrin-svn") return words;
    if (words.size() == kWordsOfSubversion) std::swap(words[1], words[2]);
    words.insert(words.begin(), {"merge", "--"});
    return words;
}

} // namespace ovrin
