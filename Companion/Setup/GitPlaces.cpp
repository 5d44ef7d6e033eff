#include "Setup/GitPlaces.h"

#include "Setup/UserFolders.h"
#include "Systems/Process.h"
#include "Words/Failure.h"

#include "FileUtils.h"

#include <cstdlib>
#include <filesystem>
#include <utility>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

std::string Absolute(const std::string& path) {
    return fs::absolute(path).lexically_normal().string();
}

std::string GitPath(const std::string& name) {
    return Absolute(WithoutLineEnd(OutputOf({"git", "rev-parse", "--git-path", name})));
}

} // namespace

std::vector<std::string> GitConfigs(Scope scope) {
    if (scope == Scope::Local) return {GitPath("config")};
    if (const char* named = std::getenv("GIT_CONFIG_GLOBAL")) {
        if (*named && std::string(named) != "/dev/null") return {Absolute(named)};
        throw Failure("GIT_CONFIG_GLOBAL says that git has no configuration of the user: unset it, or set up "
                      "the repository with --local");
    }
    std::string ofHome = HomeFor("git") + "/.gitconfig",
                ofSettings = SettingsFolderFor("git") + "/git/config";
    if (!FileExists(ofHome.c_str()) && FileExists(ofSettings.c_str())) std::swap(ofHome, ofSettings);
    return {ofHome, ofSettings};
}

std::vector<std::string> GitAttributes(Scope scope) {
    if (scope == Scope::Local) return {GitPath("info/attributes")};
    std::vector<std::string> places;
    for (const char* level : {"--global", "--system"}) {
        const std::string named =
            AnswerOf({"git", "config", level, "--includes", "--path", "--get", "core.attributesFile"});
        if (!named.empty() && places.empty()) places.push_back(Absolute(named));
    }
    places.push_back(SettingsFolderFor("git") + "/git/attributes");
    return places;
}

std::string GitHooks() {
    if (AnswerOf({"git", "rev-parse", "--is-bare-repository"}) == "true") return {};
    std::string folder = AnswerOf({"git", "config", "--path", "--get", "core.hooksPath"});
    if (folder.empty()) return GitPath("hooks");
    if (!folder.starts_with('/')) // git runs hooks at the top
        folder.insert(0, WithoutLineEnd(OutputOf({"git", "rev-parse", "--show-toplevel"})) + '/');
    return fs::path(folder).lexically_normal().string();
}

std::vector<std::string> EntriesOfGitConfig(const std::string& text) {
    if (text.empty()) return {};
    return ZeroEndedTexts(OutputOf({"git", "config", "--file", "-", "--list", "--null"}, {.input = text}));
}

} // namespace ovrin
