#include "Commands/DiffOutput.h"

#include "Changes/ChangeJson.h"
#include "Changes/ChangeMarkdown.h"
#include "Changes/ChangeText.h"
#include "Commands/Output.h"
#include "Systems/Pager.h"

#include <cstdlib>
#include <memory>
#include <string_view>
#include <unistd.h>

namespace ovrin {

namespace {

bool IsSet(const char* variable) {
    const char* value = std::getenv(variable);
    return value && *value;
}

/// git starts its external diff behind a pager that it chose to show colours with.
bool IsBehindPagerOfGit() {
    const char* value = std::getenv("GIT_PAGER_IN_USE");
    return value && (std::string_view(value) == "true" || std::string_view(value) == "1");
}

bool WantsColour(const std::string& wish) {
    if (wish != "auto") return wish == "always";
    const char* terminal = std::getenv("TERM");
    const bool isDumb = !terminal || std::string_view(terminal) == "dumb";
    return !IsSet("NO_COLOR") && !isDumb && (isatty(STDOUT_FILENO) || IsBehindPagerOfGit());
}

/// Where the text goes, piece by piece.
class Outlet {
public:
    explicit Outlet(bool mayPage) {
        const std::string pager = mayPage && isatty(STDOUT_FILENO) ? ChosenPager() : "";
        if (!pager.empty()) m_Pager = std::make_unique<Pager>(pager);
    }

    /// False once nobody reads on.
    bool Write(const std::string& text) {
        if (m_Pager) return m_Pager->Write(text);
        PrintResult(text);
        return true;
    }

private:
    std::unique_ptr<Pager> m_Pager;
};

/// Files that are no scenes are shown by lines, at the end and many at a time.
class TextOutput {
public:
    TextOutput(const ChangedFiles& changes, const DiffLook& look)
        : m_Changes(changes), m_InColour(WantsColour(look.colour)), m_Outlet(look.mayPage) {}

    bool Write(FileChange change) {
        const bool isUnmerged = change.file.status == FileStatus::Unmerged;
        if (!change.scene && change.reason.empty() && !isUnmerged) {
            m_Others.push_back(change.file);
            return m_Others.size() < kAtATime || WriteOthers();
        }
        if (!change.scene && !isUnmerged) change.lines = m_Changes.lines(std::span(&change.file, 1));
        return m_Outlet.Write(ChangeText(change, m_InColour) + "\n");
    }
    bool WriteOthers() {
        if (m_Others.empty()) return true;
        const std::string lines = m_Changes.lines(m_Others);
        m_Others.clear();
        return m_Outlet.Write(PaintedLines(lines, m_InColour) + "\n");
    }

private:
    static constexpr std::size_t kAtATime = 200;

    const ChangedFiles& m_Changes;
    const bool m_InColour;
    Outlet m_Outlet;
    std::vector<FilePair> m_Others;
};

void OutputText(const ChangedFiles& changes, const ovrin_yaml::MergeRules& rules, const ChangeWish& wish,
                const DiffLook& look) {
    TextOutput output(changes, look);
    for (const ChangedFile& file : changes.files)
        if (!output.Write(CompareFile(file, rules, wish))) return;
    output.WriteOthers();
}

} // namespace

void OutputChanges(const ChangedFiles& changes, const ovrin_yaml::MergeRules& rules, const ChangeWish& wish,
                   const DiffLook& look) {
    if (look.form == DiffForm::Text) return OutputText(changes, rules, wish, look);
    std::vector<FileChange> compared;
    for (const ChangedFile& file : changes.files) compared.push_back(CompareFile(file, rules, wish));
    if (look.form == DiffForm::Markdown) return PrintResult(ChangeMarkdown(compared));
    if (look.form == DiffForm::Json) return PrintResult(ChangeJson(compared));
    Outlet(look.mayPage).Write(ChangeStat(compared, WantsColour(look.colour)));
}

} // namespace ovrin
