#include "Systems/GitChanges.h"

#include "Systems/BlobReader.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <algorithm>
#include <memory>

namespace ovrin {

namespace {

/// "git diff" with the revisions of a wish, as it is without the user's settings.
CommandWords DiffCall(const ComparisonWish& wish, const CommandWords& options) {
    CommandWords call = {"git", "diff", "--no-ext-diff", "--no-color", "--no-relative", "--find-renames"};
    call.insert(call.end(), options.begin(), options.end());
    if (wish.isStaged) call.push_back("--cached");
    call.push_back("--end-of-options");
    call.insert(call.end(), wish.revisions.begin(), wish.revisions.end());
    call.push_back("--");
    return call;
}

/// Takes pieces off a text, up to a character each.
class Pieces {
public:
    explicit Pieces(std::string_view text) : m_Text(text) {}

    bool IsEmpty() const { return m_Text.empty(); }
    std::string Next(char end) {
        const std::size_t at = m_Text.find(end);
        if (at == std::string_view::npos) throw Failure("git lists changes in a form that isn't known");
        std::string piece(m_Text.substr(0, at));
        m_Text.remove_prefix(at + 1);
        return piece;
    }

private:
    std::string_view m_Text;
};

/// One side of an entry.
struct Side {
    std::string mode, id;

    bool IsFile() const { return mode == "100644" || mode == "100755"; }
    bool IsOnDisk() const {
        return std::ranges::all_of(id, [](char c) { return c == '0'; });
    }
};

FileStatus StatusOf(char letter) {
    switch (letter) {
    case 'A':
        return FileStatus::Added;
    case 'D':
        return FileStatus::Removed;
    case 'R':
        return FileStatus::Renamed;
    case 'C':
        return FileStatus::Copied;
    case 'U':
        return FileStatus::Unmerged;
    default:
        return FileStatus::Changed;
    }
}

class Listing {
public:
    /// `top` is that of the working tree, if the newer versions are those that stand there.
    explicit Listing(std::optional<std::string> top)
        : m_Top(std::move(top)), m_Blobs(std::make_shared<BlobReader>(ProcessSetting{})) {}

    /// ":MODE MODE ID ID STATUS", then one path or two.
    ChangedFile TakeEntry(Pieces& pieces) const {
        Side before, after;
        before.mode = pieces.Next(' ').substr(1);
        after.mode = pieces.Next(' ');
        before.id = pieces.Next(' ');
        after.id = pieces.Next(' ');
        ChangedFile changed;
        FilePair& file = changed.file;
        file.status = StatusOf(pieces.Next('\0').front());
        file.oldPath = pieces.Next('\0');
        const bool hasTwo = file.status == FileStatus::Renamed || file.status == FileStatus::Copied;
        file.newPath = hasTwo ? pieces.Next('\0') : file.oldPath;
        changed.before = VersionOf(before);
        // What git tells of a file in the working tree may be the id of a blob that it never stored.
        changed.after =
            m_Top && after.IsFile() ? VersionOnDisk(*m_Top + "/" + file.newPath) : VersionOf(after);
        return changed;
    }

private:
    FileVersion VersionOf(const Side& side) const {
        if (!side.IsFile()) return nullptr;
        return
            [blobs = m_Blobs, id = side.id](const IsWanted& isWanted) { return blobs->ReadIf(id, isWanted); };
    }

    const std::optional<std::string> m_Top;
    const std::shared_ptr<BlobReader> m_Blobs;
};

/// git tells the path of a conflict twice where ours differs from the working tree.
void DropRepeatedUnmerged(std::vector<ChangedFile>& files) {
    std::vector<std::string> unmerged;
    for (const ChangedFile& changed : files)
        if (changed.file.status == FileStatus::Unmerged) unmerged.push_back(changed.file.newPath);
    std::erase_if(files, [&](const ChangedFile& changed) {
        return changed.file.status != FileStatus::Unmerged &&
               std::ranges::count(unmerged, changed.file.newPath);
    });
}

/// The commits of "A..B" and "A...B".
std::vector<std::string> Ends(const std::string& revision) {
    const std::size_t dots = revision.find("..");
    if (dots == std::string::npos) return {revision};
    const std::size_t behind = revision.find_first_not_of('.', dots);
    return {revision.substr(0, dots), behind == std::string::npos ? "" : revision.substr(behind)};
}

/// A word may stand for two commits.
bool IsAgainstWorkingTree(const ComparisonWish& wish) {
    if (wish.isStaged) return false;
    if (wish.revisions.empty()) return true;
    CommandWords call = {"git", "rev-parse", "--revs-only", "--end-of-options"};
    call.insert(call.end(), wish.revisions.begin(), wish.revisions.end());
    return std::ranges::count(OutputOf(call), '\n') == 1;
}

void NameVersions(ChangedFiles& changes, const ComparisonWish& wish, bool isAgainstTree) {
    const std::vector<std::string>& revisions = wish.revisions;
    changes.before = !revisions.empty() ? revisions[0] : wish.isStaged ? "HEAD" : "the index";
    changes.after = wish.isStaged ? "the index" : "the working tree";
    if (wish.isStaged || isAgainstTree) return;
    const std::vector<std::string> ends = revisions.size() > 1 ? revisions : Ends(revisions[0]);
    const bool areNamed = ends.size() > 1;
    const auto named = [](const std::string& end) { return end.empty() ? "HEAD" : end; };
    changes.before = areNamed ? named(ends[0]) : "";
    changes.after = areNamed ? named(ends[1]) : "";
    if (areNamed && revisions[0].find("...") != std::string::npos)
        changes.before = "where " + changes.after + " left " + changes.before;
}

bool NamesSomething(const std::string& path, const ComparisonWish& wish) {
    if (RunProcess({"git", "ls-files", "--error-unmatch", "--", path}).Succeeded()) return true;
    std::vector<std::string> commits = {"HEAD"};
    for (const std::string& revision : wish.revisions)
        for (const std::string& end : Ends(revision)) commits.push_back(end.empty() ? "HEAD" : end);
    return std::ranges::any_of(commits, [&](const std::string& commit) {
        return !RunProcess({"git", "ls-tree", "-r", "--name-only", commit, "--", path}).output.empty();
    });
}

std::string DiffByLines(const ComparisonWish& wish, std::span<const FilePair> files) {
    CommandWords call = DiffCall(wish, {});
    for (const FilePair& file : files) {
        call.push_back(":(top,literal)" + file.newPath);
        if (file.oldPath != file.newPath) call.push_back(":(top,literal)" + file.oldPath);
    }
    return OutputOf(call);
}

} // namespace

bool IsGitRevision(const std::string& word) {
    const ProcessResult result = RunProcess({"git", "rev-parse", "--revs-only", "--end-of-options", word});
    return result.Succeeded() && !result.output.empty();
}

ChangedFiles ListGitChanges(const Repository& repository, const ComparisonWish& wish) {
    const bool isAgainstTree = IsAgainstWorkingTree(wish);
    if (isAgainstTree && repository.top.empty())
        throw Failure("A repository without a working tree: name two revisions, \"ovrin diff OLD NEW\"");
    CommandWords call = DiffCall(wish, {"--raw", "-z", "--no-abbrev"});
    call.insert(call.end(), wish.paths.begin(), wish.paths.end());
    const std::string listed = OutputOf(call);
    for (const std::string& path : wish.paths)
        if (!NamesSomething(path, wish))
            throw Failure(
                "\"" + path +
                "\" is no revision, and no file that git knows: \"git status\" tells what isn't tracked");
    const Listing listing(isAgainstTree ? std::optional(repository.top) : std::nullopt);
    ChangedFiles changes;
    NameVersions(changes, wish, isAgainstTree);
    for (Pieces pieces(listed); !pieces.IsEmpty();) changes.files.push_back(listing.TakeEntry(pieces));
    DropRepeatedUnmerged(changes.files);
    changes.lines = [wish](std::span<const FilePair> files) { return DiffByLines(wish, files); };
    return changes;
}

} // namespace ovrin
