#include "Commands/MergeCommand.h"

#include "Commands/FileMerge.h"
#include "Names/PrintableText.h"
#include "Words/Failure.h"
#include "Words/WriteFailure.h"

#include <CLI/CLI.hpp>
#include <memory>
#include <new>
#include <utility>

namespace ovrin {

namespace {

constexpr std::size_t kWordsOfSubversion = 5;

constexpr const char* kPutScene = "put a good version in its place, and tell version control that it is "
                                  "settled.";
constexpr const char* kPutSetting =
    "put that right, and then, with git, let \"ovrin settle\" merge it again; "
    "with others, let version control do so.";
constexpr const char* kMakeRoom =
    "version control keeps all three versions. Make room there, or let it be written to, and then, with git, "
    "let \"ovrin settle\" merge it again; with others, let version control do so.";

Failure NotMerged(const FileMerge& files, const std::exception& error, const char* next) {
    return Failure(Printable(files.path) + " is not merged: " + error.what() +
                   "\nIt stays unmerged, and nothing was changed: " + next);
}

/// What ends a merge names its scene, and what becomes of that.
Outcome MergeOrTell(const FileMerge& files) {
    try {
        return Merge(files);
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const BadSetting& error) {
        throw NotMerged(files, error, kPutSetting);
    } catch (const WriteFailure& error) {
        throw NotMerged(files, error, kMakeRoom);
    } catch (const std::exception& error) {
        throw NotMerged(files, error, kPutScene);
    }
}

} // namespace

Action DescribeMerge(CLI::App& command) {
    auto files = std::make_shared<FileMerge>();
    files->format = FormatFiles::OfEnvironment();
    command.add_option("--base-label", files->labels.base, "what the base is called, in messages")
        ->type_name("LABEL");
    command.add_option("--our-label", files->labels.ours, "what ours is called: a branch or commit")
        ->type_name("LABEL");
    command.add_option("--their-label", files->labels.theirs, "what theirs is called")->type_name("LABEL");
    command
        .add_option("--rules", files->format.rules, "the merge rules, in place of those beside the program")
        ->type_name("FILE");
    command.add_option("--typeInfo", files->format.typeInfo, "the types of components and what they require")
        ->type_name("FILE");
    command.add_option("BASE", files->base, "the common ancestor; empty if both sides added the scene")
        ->required();
    command.add_option("OURS", files->ours, "the scene as it is here")->required();
    command.add_option("THEIRS", files->theirs, "the scene as it comes in")->required();
    command.add_option("RESULT", files->result, "where the merged scene goes; may be one of the others")
        ->required();
    command.add_option("PATH", files->path, "the scene's path in the working tree")->required();
    command.footer(
        "At open conflicts the result has ours, or what OVRIN_TAKE or the setting ovrin.take says.");
    return [files] { return MergeOrTell(*files); };
}

std::vector<std::string> ArgumentsFor(const std::string& program, std::vector<std::string> words) {
    if (program.substr(program.rfind('/') + 1) != "ovrin-svn") return words;
    if (words.size() == kWordsOfSubversion) std::swap(words[1], words[2]);
    words.insert(words.begin(), {"merge", "--"});
    return words;
}

} // namespace ovrin
