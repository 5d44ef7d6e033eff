#include "Systems/Git.h"

#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cstdlib>
#include <string_view>
#include <utility>

namespace ovrin {

namespace {

/// "MODE OBJECT STAGE\tPATH"
GitEntry ParseEntry(const std::string& field) {
    const std::size_t mode = field.find(' ');
    const std::size_t object = field.find(' ', mode + 1);
    const std::size_t tab = field.find('\t', object + 1);
    if (tab != object + 2) throw Failure("git lists its index in a form that isn't known: " + field);
    return {field.substr(tab + 1), field.substr(0, mode), field.substr(mode + 1, object - mode - 1),
            static_cast<GitEntry::Stage>(field[object + 1] - '0')};
}

std::vector<GitEntry> ParseEntries(std::string_view listing) {
    std::vector<GitEntry> entries;
    for (const std::string& field : ZeroEndedTexts(listing)) entries.push_back(ParseEntry(field));
    return entries;
}

} // namespace

Git::Git(const Repository& repository)
    : m_Folder(repository.top.empty() ? repository.data : repository.top), m_Data(repository.data) {
    // git takes relative folders of its environment from where it is started. Where there are none it is left
    // to find the repository, and to refuse one of somebody else.
    if (!std::getenv("GIT_DIR")) return;
    m_Environment.emplace_back("GIT_DIR", repository.data);
    if (!repository.top.empty()) m_Environment.emplace_back("GIT_WORK_TREE", repository.top);
}

Git Git::WithOwnIndex() const {
    Git other = *this;
    if (std::getenv("GIT_INDEX_FILE")) other.m_Environment.emplace_back("GIT_INDEX_FILE", m_Data + "/index");
    return other;
}

ProcessSetting Git::Setting(std::string input) const {
    return {.folder = m_Folder, .input = std::move(input), .environment = m_Environment};
}

Git Git::With(const std::vector<std::pair<std::string, std::string>>& variables) const {
    Git other = *this;
    for (const auto& variable : variables) {
        std::erase_if(other.m_Environment, [&](const auto& old) { return old.first == variable.first; });
        other.m_Environment.push_back(variable);
    }
    return other;
}

ProcessResult Git::Run(CommandWords arguments, std::string input) const {
    arguments.insert(arguments.begin(), {"git", "--literal-pathspecs"});
    return RunProcess(arguments, Setting(std::move(input)));
}

std::string Git::Output(CommandWords arguments, std::string input) const {
    arguments.insert(arguments.begin(), {"git", "--literal-pathspecs"});
    return OutputOf(arguments, Setting(std::move(input)));
}

std::vector<GitEntry> Git::Unmerged() const {
    return ParseEntries(Output({"ls-files", "--unmerged", "-z"}));
}

std::vector<GitEntry> Git::Entries() const {
    return ParseEntries(Output({"ls-files", "--stage", "-z"}));
}

std::vector<std::string> Git::Untracked() const {
    return ZeroEndedTexts(Output({"ls-files", "--others", "--exclude-standard", "-z"}));
}

std::vector<std::string> Git::DifferingFromHead(const std::vector<std::string>& paths,
                                                bool inIndexAlone) const {
    CommandWords command = {"diff-index", "-z", "--name-only", "--no-renames", "--ignore-submodules"};
    if (inIndexAlone) command.emplace_back("--cached");
    const bool hasCommit = !Commit("HEAD").empty();
    if (!hasCommit) command = {"ls-files", "--cached", "-z"};
    if (hasCommit) command.emplace_back("HEAD");
    command.emplace_back("--");
    command.insert(command.end(), paths.begin(), paths.end());
    return ZeroEndedTexts(Output(std::move(command)));
}

bool Git::IsSameIn(const std::string& commit, const std::string& other, const std::string& path) const {
    return Run({"diff-tree", "--quiet", commit, other, "--", path}).Succeeded();
}

bool Git::StoresAs(const std::string& path, const std::string& bytes) const {
    return Output({"hash-object", "--", path}) == Output({"hash-object", "--stdin"}, bytes);
}

std::string Git::Commit(const std::string& name) const {
    const ProcessResult result = Run({"rev-parse", "--verify", "--quiet", name + "^{commit}"});
    return result.Succeeded() ? WithoutLineEnd(result.output) : "";
}

std::string Git::NameOfCommit(const std::string& commit) const {
    std::string name = WithoutLineEnd(Run({"name-rev", "--name-only", "--no-undefined", "--refs=refs/heads/*",
                                           "--refs=refs/remotes/*", "--refs=refs/tags/*", commit})
                                          .output);
    if (name.ends_with("^0")) name.resize(name.size() - 2); // a tag with words of its own
    // One that only leads to the commit, "main~3", tells less than the number.
    const bool isItsOwn = !name.empty() && name.find_first_of("~^") == std::string::npos;
    for (const std::string_view kind : {"tags/", "remotes/"})
        if (isItsOwn && name.starts_with(kind)) return name.substr(kind.size());
    if (isItsOwn) return name;
    return WithoutLineEnd(Output({"rev-parse", "--short", commit}));
}

std::optional<std::string> Git::ConfigValue(const std::string& name) const {
    const ProcessResult result = Run({"config", "-z", "--get", name});
    const std::vector<std::string> values = ZeroEndedTexts(result.output);
    if (!result.Succeeded() || values.empty()) return {};
    return values.front();
}

void Git::Add(const std::vector<std::string>& paths) const {
    std::string input;
    for (const std::string& path : paths) input += path + '\0';
    Output({"update-index", "--add", "-z", "--stdin"}, std::move(input));
}

} // namespace ovrin
