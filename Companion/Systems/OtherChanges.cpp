#include "Systems/OtherChanges.h"

#include "Systems/Process.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cctype>
#include <memory>
#include <utility>

namespace ovrin {

namespace {

/// How one of the systems is called. Paths are as it lists them.
struct Caller {
    virtual ~Caller() = default;
    /// The letter of what happened, and the path.
    virtual std::vector<std::pair<char, std::string>> List() const = 0;
    virtual CommandWords Cat(const std::string& revision, const std::string& path) const = 0;
    virtual CommandWords Diff() const = 0;
    virtual std::string Operand(const std::string& path) const = 0;
    virtual std::string OnDisk(const std::string& path) const = 0;
    /// What the working copy came from.
    virtual const char* Parent() const = 0;
};

/// What is said must not depend on the user's language, and names are of any letters.
const ProcessSetting kPlain{.environment = {{"LC_ALL", "C.UTF-8"}, {"HGPLAIN", "1"}}};

class Mercurial final : public Caller {
public:
    Mercurial(std::string top, ComparisonWish wish) : m_Top(std::move(top)), m_Wish(std::move(wish)) {}

    std::vector<std::pair<char, std::string>> List() const override {
        CommandWords call = {"hg", "status", "-mard", "-T", "{status}{path}\\0"};
        for (const std::string& revision : m_Wish.revisions) call.insert(call.end(), {"--rev", revision});
        call.push_back("--");
        call.insert(call.end(), m_Wish.paths.begin(), m_Wish.paths.end());
        const std::string listed = OutputOf(call, kPlain);
        std::vector<std::pair<char, std::string>> entries;
        for (std::size_t at = 0, end; (end = listed.find('\0', at)) != std::string::npos; at = end + 1)
            entries.emplace_back(listed[at], listed.substr(at + 1, end - at - 1));
        return entries;
    }
    CommandWords Cat(const std::string& revision, const std::string& path) const override {
        return {"hg", "cat", "-r", revision, "--", Operand(path)};
    }
    CommandWords Diff() const override {
        CommandWords call = {"hg", "diff", "--git"};
        for (const std::string& revision : m_Wish.revisions) call.insert(call.end(), {"-r", revision});
        return call;
    }
    std::string Operand(const std::string& path) const override { return "path:" + path; }
    std::string OnDisk(const std::string& path) const override { return m_Top + "/" + path; }
    const char* Parent() const override { return "."; }

private:
    const std::string m_Top;
    const ComparisonWish m_Wish;
};

/// A path as it stands in an address.
std::string AsAddress(const std::string& path) {
    constexpr std::string_view kPlainSigns = "/-._~";
    std::string address;
    for (const char letter : path) {
        const auto byte = static_cast<unsigned char>(letter);
        if (std::isalnum(byte) || kPlainSigns.find(letter) != std::string_view::npos)
            address += letter;
        else
            address += std::string("%") + "0123456789ABCDEF"[byte >> 4] + "0123456789ABCDEF"[byte & 15];
    }
    return address;
}

class Subversion final : public Caller {
public:
    explicit Subversion(ComparisonWish wish) : m_Wish(std::move(wish)) {}

    /// Lines of a letter, seven columns that don't matter, and the path.
    std::vector<std::pair<char, std::string>> List() const override {
        constexpr std::size_t kPathAt = 8;
        CommandWords call = Diff();
        call.insert(call.end(), {"--summarize", "--"});
        for (const std::string& path : m_Wish.paths) call.push_back(Operand(path));
        const std::string listed = OutputOf(call, kPlain);
        std::vector<std::pair<char, std::string>> entries;
        for (std::size_t at = 0, end; (end = listed.find('\n', at)) != std::string::npos; at = end + 1)
            if (end > at + kPathAt && listed[at] != ' ')
                entries.emplace_back(listed[at], listed.substr(at + kPathAt, end - at - kPathAt));
        return entries;
    }
    CommandWords Cat(const std::string& revision, const std::string& path) const override {
        if (revision == Parent()) return {"svn", "cat", "-r", revision, "--", path + "@"};
        // By its address, since the working copy may have lost the file.
        std::string folder = OutputOf({"svn", "info", "--show-item", "url", "."}, kPlain);
        while (folder.ends_with('\n')) folder.pop_back();
        return {"svn", "cat", folder + "/" + AsAddress(path) + "@" + revision};
    }
    CommandWords Diff() const override {
        CommandWords call = {"svn", "diff"};
        std::string range;
        for (const std::string& revision : m_Wish.revisions) range += (range.empty() ? "" : ":") + revision;
        if (!range.empty()) call.insert(call.end(), {"-r", range});
        return call;
    }
    /// What stands behind the last @ would be a revision, but where only the working copy is looked at.
    std::string Operand(const std::string& path) const override {
        return m_Wish.revisions.empty() ? path : path + "@";
    }
    std::string OnDisk(const std::string& path) const override { return path; }
    const char* Parent() const override { return "BASE"; }

private:
    const ComparisonWish m_Wish;
};

FileVersion VersionAt(const std::shared_ptr<const Caller>& caller, const std::string& revision,
                      const std::string& path) {
    return [=](const IsWanted& isWanted) -> std::optional<std::string> {
        std::string bytes = OutputOf(caller->Cat(revision, path), kPlain);
        if (!isWanted(bytes)) return std::nullopt;
        return bytes;
    };
}

} // namespace

ChangedFiles ListOtherChanges(const Repository& repository, const ComparisonWish& wish) {
    if (wish.isStaged) throw Failure("Only git has an index: leave --staged out");
    if (wish.revisions.size() > 2) throw Failure("More than two revisions can't be compared");
    std::shared_ptr<const Caller> caller;
    if (repository.kind == SystemKind::Mercurial)
        caller = std::make_shared<Mercurial>(repository.top, wish);
    else
        caller = std::make_shared<Subversion>(wish);
    const std::string before = wish.revisions.empty() ? caller->Parent() : wish.revisions[0];
    ChangedFiles changes;
    changes.before = wish.revisions.empty() ? "the last commit" : before;
    changes.after = wish.revisions.size() > 1 ? wish.revisions[1] : "the working copy";
    for (const auto& [letter, path] : caller->List()) {
        ChangedFile changed{{FileStatus::Changed, path, path}, VersionAt(caller, before, path), nullptr};
        changed.after = wish.revisions.size() > 1 ? VersionAt(caller, wish.revisions[1], path)
                                                  : VersionOnDisk(caller->OnDisk(path));
        if (letter == 'A') changed = {{FileStatus::Added, path, path}, nullptr, changed.after};
        if (letter == 'R' || letter == 'D' || letter == '!')
            changed = {{FileStatus::Removed, path, path}, changed.before, nullptr};
        changes.files.push_back(std::move(changed));
    }
    changes.lines = [caller](std::span<const FilePair> files) {
        CommandWords call = caller->Diff();
        call.push_back("--");
        for (const FilePair& file : files) call.push_back(caller->Operand(file.newPath));
        return OutputOf(call, kPlain);
    };
    return changes;
}

} // namespace ovrin
