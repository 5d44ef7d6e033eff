#include "Systems/MergeTree.h"

#include "Systems/Git.h"
#include "Systems/PartialClone.h"
#include "Systems/Repository.h"
#include "Systems/ScratchFolder.h"
#include "Words/Failure.h"

#include <algorithm>
#include <cstdlib>
#include <map>
#include <string_view>

namespace ovrin {

namespace {

std::string_view TakeUntil(std::string_view& text, char end) {
    const std::size_t length = std::min(text.find(end), text.size());
    const std::string_view taken = text.substr(0, length);
    text.remove_prefix(std::min(length + 1, text.size()));
    return taken;
}

/// One of a list of folders in a variable, where colons and quotes would have a meaning.
std::string QuotedFolder(const std::string& path) {
    std::string quoted = "\"";
    for (const char character : path) {
        if (character == '"' || character == '\\') quoted += '\\';
        quoted += character;
    }
    return quoted + '"';
}

/// git with the objects of a repository, whose new objects go into a folder of their own.
Git GitBeside(const Repository& repository, const std::string& tree, const std::string& newObjects) {
    const Git git(repository);
    const std::string objects =
        WithoutLineEnd(git.Output({"rev-parse", "--path-format=absolute", "--git-path", "objects"}));
    std::string alternates = QuotedFolder(objects);
    if (const char* others = std::getenv("GIT_ALTERNATE_OBJECT_DIRECTORIES"))
        alternates += ':' + std::string(others);
    return git.With({{"GIT_DIR", repository.data},
                     {"GIT_WORK_TREE", tree},
                     {"GIT_OBJECT_DIRECTORY", newObjects},
                     {"GIT_ALTERNATE_OBJECT_DIRECTORIES", alternates},
                     {"GIT_ATTR_NOSYSTEM", "1"}});
}

/// What `git merge-tree -z` says, started in `tree`, where it puts files for merge drivers. Its driver for
/// binary files, which takes no look at them, is made that of all files: so every content that needs merging
/// is a conflict. The repository's own attributes may still name ours, which is made to fail.
std::string RunMergeTree(const Git& git, const std::string& tree, const std::string& ours,
                         const std::string& theirs) {
    ProcessResult result =
        git.Run({"-C", tree, "-c", "core.attributesFile=/dev/null", "-c", "merge.default=binary", "-c",
                 "merge.ovrin.driver=false", "-c", "merge.ovrin.recursive=binary", "merge-tree",
                 "--write-tree", "-z", ours, theirs});
    if (result.status > 1) throw Failure("git can't try the merge:\n" + result.errors);
    return std::move(result.output);
}

/// Reads what `git merge-tree -z` says:
///
///     TREE NUL
///     MODE SP ID SP STAGE TAB PATH NUL              for each stage of a file that is left unmerged
///     NUL
///     COUNT NUL PATH NUL... KIND NUL WORDS NUL      for each message; a kind is "CONFLICT (modify/delete)"
class Answer {
public:
    Answer(const std::string& ours, const std::string& theirs) : m_Ends{"~" + ours, "~" + theirs} {}

    std::vector<UnmergedFile> Read(std::string_view text) {
        TakeUntil(text, '\0');
        for (std::string_view stage = TakeUntil(text, '\0'); !stage.empty(); stage = TakeUntil(text, '\0'))
            TakeStage(stage);
        while (!text.empty()) TakeMessage(text);
        for (const std::vector<std::string>& names : m_Renames) Unite(names);
        std::vector<UnmergedFile> list;
        for (auto& [path, file] : m_Files) {
            file.path = path;
            std::ranges::sort(file.conflicts);
            file.conflicts.erase(std::unique(file.conflicts.begin(), file.conflicts.end()),
                                 file.conflicts.end());
            list.push_back(std::move(file));
        }
        return list;
    }

private:
    /// A file in the way of a folder goes under its name, "~" and that of its commit.
    std::string OwnPath(std::string_view path) const {
        for (const std::string& end : m_Ends) {
            const std::size_t at = path.rfind(end);
            if (at == std::string_view::npos) continue;
            const std::string_view rest = path.substr(at + end.size());
            if (rest.find_first_not_of("_0123456789") == std::string_view::npos)
                return std::string(path.substr(0, at));
        }
        return std::string(path);
    }

    void TakeStage(std::string_view text) {
        const std::string_view mode = TakeUntil(text, ' ');
        const std::string_view id = TakeUntil(text, ' ');
        const std::string_view stage = TakeUntil(text, '\t');
        UnmergedFile& file = m_Files[OwnPath(text)];
        const TreeEntry entry = {std::string(id), mode.starts_with("100"), 0};
        (stage == "1" ? file.base : stage == "2" ? file.ours : file.theirs) = entry;
    }

    void TakeMessage(std::string_view& text) {
        const std::string count(TakeUntil(text, '\0'));
        std::vector<std::string> paths;
        for (auto left = std::strtoul(count.c_str(), nullptr, 10); left > 0 && !text.empty(); --left)
            paths.push_back(OwnPath(TakeUntil(text, '\0')));
        const std::string_view kind = TakeUntil(text, '\0');
        TakeUntil(text, '\0');
        const std::size_t open = kind.find('(');
        if (!kind.starts_with("CONFLICT") || open == std::string_view::npos) return;
        const std::string_view name = kind.substr(open + 1, kind.rfind(')') - open - 1);
        if (name == "contents" || name == "binary") return;
        if (name == "rename/rename" && paths.size() == 3) m_Renames.push_back(paths);
        for (const std::string& path : paths)
            if (const auto file = m_Files.find(path); file != m_Files.end())
                file->second.conflicts.emplace_back(name);
    }

    /// A file that has different names in base, ours and theirs is listed under each of them.
    void Unite(const std::vector<std::string>& names) {
        const auto base = m_Files.find(names[0]), ours = m_Files.find(names[1]),
                   theirs = m_Files.find(names[2]);
        for (const auto& file : {base, ours, theirs})
            if (file == m_Files.end()) return;
        const bool isAlone = !base->second.ours && !base->second.theirs && !ours->second.base &&
                             !ours->second.theirs && !theirs->second.base && !theirs->second.ours;
        if (!isAlone) return; // each has to do with other files, too
        ours->second.base = base->second.base;
        ours->second.theirs = theirs->second.theirs;
        ours->second.pathInTheirs = names[2];
        m_Files.erase(base);
        m_Files.erase(theirs);
    }

    const std::string m_Ends[2];
    std::map<std::string, UnmergedFile> m_Files;
    std::vector<std::vector<std::string>> m_Renames; // names in base, ours and theirs
};

std::vector<TreeEntry*> BlobsOf(std::vector<UnmergedFile>& files) {
    std::vector<TreeEntry*> blobs;
    for (UnmergedFile& file : files)
        for (auto* entry : {&file.base, &file.ours, &file.theirs})
            if (*entry && (*entry)->isFile) blobs.push_back(&**entry);
    return blobs;
}

/// In a partial clone even the size of a blob is only known where the blob is.
void FetchMissing(const Git& git, std::vector<UnmergedFile>& files) {
    std::vector<std::string> ids;
    for (const TreeEntry* blob : BlobsOf(files)) ids.push_back(blob->id);
    FetchBlobs(git, ids);
}

void LookUpSizes(const Git& git, std::vector<UnmergedFile>& files) {
    const std::vector<TreeEntry*> blobs = BlobsOf(files);
    std::string ids;
    for (const TreeEntry* blob : blobs) ids += blob->id + "\n";
    const std::string output = git.Output({"cat-file", "--batch-check=%(objectsize)"}, std::move(ids));
    std::string_view lines = output;
    for (TreeEntry* blob : blobs) {
        const std::string line(TakeUntil(lines, '\n'));
        char* end = nullptr;
        blob->size = std::strtoull(line.c_str(), &end, 10);
        if (line.empty() || *end) throw Failure("The repository lacks an object: git says \"" + line + "\"");
    }
}

/// Without a working tree the attributes are those of the commit.
void LookUpAttributes(const Repository& repository, const std::string& commit, const ScratchFolder& scratch,
                      std::vector<UnmergedFile>& files) {
    Git git(repository);
    CommandWords command = {"check-attr", "-z", "--stdin", "merge"};
    if (repository.top.empty()) {
        git = git.With({{"GIT_INDEX_FILE", scratch.File("index")}});
        git.Output({"read-tree", commit});
        command.insert(command.begin() + 1, "--cached");
    }
    std::string paths;
    for (const UnmergedFile& file : files) paths += file.path + '\0';
    const std::string output = git.Output(command, std::move(paths));
    std::string_view text = output;
    for (UnmergedFile& file : files) {
        TakeUntil(text, '\0'); // the path
        TakeUntil(text, '\0'); // "merge"
        file.isByObjects = TakeUntil(text, '\0') == "ovrin";
    }
}

} // namespace

std::vector<UnmergedFile> ListUnmerged(const Repository& repository, const std::string& ours,
                                       const std::string& theirs) {
    const ScratchFolder scratch;
    const std::string tree = scratch.NewFolder("tree");
    const Git beside = GitBeside(repository, tree, scratch.NewFolder("objects"));
    std::vector<UnmergedFile> files = Answer(ours, theirs).Read(RunMergeTree(beside, tree, ours, theirs));
    if (files.empty()) return files;
    FetchMissing(Git(repository), files);
    LookUpSizes(beside, files);
    LookUpAttributes(repository, ours, scratch, files);
    return files;
}

} // namespace ovrin
