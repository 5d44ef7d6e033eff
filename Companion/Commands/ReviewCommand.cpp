#include "Commands/ReviewCommand.h"

#include "Commands/DiffArguments.h"
#include "Commands/ReviewVersions.h"
#include "Destination.h"
#include "Names/PrintableText.h"
#include "Review/ReviewPage.h"
#include "Settle/Web/PageFiles.h"
#include "Settle/Web/PageServer.h"
#include "Settle/Web/SinglePage.h"
#include "Words/Failure.h"
#include "Words/ProgressCount.h"
#include "Words/WriteFailure.h"

#include <CLI/CLI.hpp>
#include <iostream>
#include <memory>

namespace ovrin {

namespace {

struct ReviewWish {
    DiffOperands operands;
    std::string merge; // a commit
    std::string file;  // for the page
    PageOptions page;
};

ReviewSources SourcesOf(const ReviewWish& wish) {
    if (wish.merge.empty()) return VersionsToReview(wish.operands);
    if (!wish.operands.words.empty())
        throw Failure(
            "--merge shows the sides of a merge, without other revisions: write paths behind \"--\"");
    return SidesOfMerge(wish.merge, wish.operands.paths);
}

std::string CountOf(std::size_t count, const char* what) {
    return std::to_string(count) + " " + what + (count == 1 ? "" : "s");
}

/// What the page doesn't show, or shows as a problem alone.
void TellRest(const ReviewPage& review) {
    for (const std::string& problem : review.Problems()) std::cerr << problem << ".\n";
    if (const std::size_t others = review.CountOthers())
        std::cerr << CountOf(others, "file") << (others == 1 ? " is" : " are")
                  << " not shown, being no scene: \"ovrin diff\" has all.\n";
}

void WritePage(const std::string& file, ReviewPage& review, const ReviewPage::Progress& progress) {
    std::size_t leftOut = 0;
    const std::string page = SinglePage(PageFiles(), review.Whole(progress, leftOut));
    if (leftOut)
        std::cerr << "The page has no room for the values of " << CountOf(leftOut, "object")
                  << ": \"ovrin review\" without --html shows them.\n";
    const std::string path = file == "-" ? "" : file;
    if (const int error = Deliver(
            path, {page.size(), [&page](OutputStream& stream) { stream << page; }, Durability::Synced}))
        throw Failure("Cannot write " + Printable(file) + ": " + WhyNotWritten(error));
}

void Serve(const PageOptions& options, ReviewPage& review) {
    ServePages(options, [&](const PageRequest& request) {
        if (std::optional<PageAnswer> file = AnswerPageFile(request)) return std::move(*file);
        return review.Answer(request);
    });
}

Outcome RunReview(const ReviewWish& wish) {
    ReviewSources sources = SourcesOf(wish);
    const bool isMerge = sources.isMerge;
    ProgressCount count;
    const auto progress = [&](std::size_t done, std::size_t all) {
        count.Tell("Reading scenes: " + std::to_string(done) + " of " + std::to_string(all));
    };
    ReviewPage review(std::move(sources), ReadSceneRules(FormatFiles::OfEnvironment()), progress);
    if (review.CountScenes() == 0) {
        std::cerr << (isMerge ? "Nothing to review: there is no scene that both sides changed.\n"
                              : "Nothing to review: no scene differs.\n");
        TellRest(review);
        return Outcome::Done;
    }
    TellRest(review);
    if (wish.file.empty())
        Serve(wish.page, review);
    else
        WritePage(wish.file, review, progress);
    return review.Problems().empty() ? Outcome::Done : Outcome::LeftOpen;
}

} // namespace

Action DescribeReview(CLI::App& command) {
    const auto wish = std::make_shared<ReviewWish>();
    auto* staged = AddDiffOperands(
        command, wish->operands,
        "none: the working tree against the last commit; one: against the working tree; two, or "
        "A..B, A...B: against each other; or two files, or three: BASE OURS THEIRS");
    command.add_option("--merge", wish->merge, "show the two sides of a merge, and what came of them")
        ->type_name("COMMIT")
        ->excludes(staged);
    auto* html =
        command.add_option("--html", wish->file, "write the page into this file; -: to standard output")
            ->type_name("FILE");
    command.add_option("--port", wish->page.port, "serve the page there; 0: at any port that is free")
        ->check(CLI::Range(0, 65535))
        ->capture_default_str()
        ->excludes(html);
    command
        .add_flag("--no-browser{false}", wish->page.opensBrowser, "tell the page's address, and open nothing")
        ->excludes(html);
    return [wish] { return RunReview(*wish); };
}

} // namespace ovrin
