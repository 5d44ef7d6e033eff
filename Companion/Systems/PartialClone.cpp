#include "Systems/PartialClone.h"

#include "Systems/Git.h"

#include <string_view>

namespace ovrin {

namespace {

/// The first remote that has what this clone left out; empty if it is a whole one.
std::string RemoteOfRest(const Git& git) {
    constexpr std::string_view kBegin = "remote.", kEnd = ".promisor\ntrue";
    const ProcessResult result =
        git.Run({"config", "-z", "--type=bool", "--get-regexp", "^remote\\..*\\.promisor$"});
    for (const std::string& entry : ZeroEndedTexts(result.output))
        if (entry.starts_with(kBegin) && entry.ends_with(kEnd))
            return entry.substr(kBegin.size(), entry.size() - kBegin.size() - kEnd.size());
    return {};
}

} // namespace

void FetchBlobs(const Git& git, const std::vector<std::string>& ids) {
    const std::string remote = ids.empty() ? "" : RemoteOfRest(git);
    if (remote.empty()) return;
    std::string input;
    for (const std::string& id : ids) input += id + '\n';
    // As git itself does it for many at a time, such as those of a checkout; it leaves out those that are
    // there.
    git.Run({"-c", "fetch.negotiationAlgorithm=noop", "fetch", "--quiet", "--no-tags",
             "--no-write-fetch-head", "--no-auto-maintenance", "--recurse-submodules=no",
             "--filter=blob:none", "--stdin", "--end-of-options", remote},
            std::move(input));
}

} // namespace ovrin
