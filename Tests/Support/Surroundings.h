#pragma once

#include "Support/Program.h"

#include <cstdlib>
#include <map>
#include <optional>
#include <string>
#include <sys/resource.h>
#include <sys/stat.h>

/// What a program finds around itself: variables, the present folder, other programs.
namespace surroundings {

namespace fs = std::filesystem;

/// An environment variable for as long as this lives; it is unset where there is no value.
class Variable {
public:
    Variable(const char* name, const std::optional<std::string>& value) : m_Name(name) {
        if (const char* before = std::getenv(name)) m_Before = before;
        Set(value);
    }
    Variable(const Variable&) = delete;
    Variable& operator=(const Variable&) = delete;
    ~Variable() { Set(m_Before); }

private:
    void Set(const std::optional<std::string>& value) {
        value ? setenv(m_Name.c_str(), value->c_str(), 1) : unsetenv(m_Name.c_str());
    }

    const std::string m_Name;
    std::optional<std::string> m_Before;
};

/// The present folder for as long as this lives.
class Here {
public:
    explicit Here(const fs::path& folder) : m_Before(fs::current_path()) { fs::current_path(folder); }
    Here(const Here&) = delete;
    Here& operator=(const Here&) = delete;
    ~Here() { fs::current_path(m_Before); }

private:
    const fs::path m_Before;
};

/// No file can be written that is longer, as on a full disk, for as long as this lives.
class FileLimit {
public:
    explicit FileLimit(rlim_t bytes) {
        getrlimit(RLIMIT_FSIZE, &m_Before);
        const rlimit limit{bytes, m_Before.rlim_max};
        setrlimit(RLIMIT_FSIZE, &limit);
    }
    FileLimit(const FileLimit&) = delete;
    FileLimit& operator=(const FileLimit&) = delete;
    ~FileLimit() { setrlimit(RLIMIT_FSIZE, &m_Before); }

private:
    rlimit m_Before{};
};

/// Programs that say what they are told to, in front of all others on the path. With --batch they wait for a
/// request first.
class FakePrograms {
public:
    FakePrograms()
        : m_Path("PATH", (m_Folder.Path() / "bin").string() + ":" + std::getenv("PATH")),
          m_Says("OVRIN_TEST_SAYS", m_Folder.Path().string()) {}

    /// What a program says where `word` is among its arguments, and how it ends; "" is among all.
    void Say(const std::string& program, const std::string& word, const std::string& output, int status = 0) {
        const std::string name = program + "/" + (word.empty() ? "otherwise" : word);
        m_Folder.Write(name, output);
        m_Folder.Write(name + ".status", std::to_string(status));
        m_Folder.Write("bin/" + program, kScript);
        chmod((m_Folder.Path() / "bin" / program).c_str(), S_IRWXU);
    }
    /// All calls, a line each, "git diff --raw".
    std::string Calls() const { return m_Folder.Read("calls"); }
    const fs::path& Folder() const { return m_Folder.Path(); }

private:
    static constexpr const char* kScript =
        "#!/bin/sh\nown=\"$OVRIN_TEST_SAYS/${0##*/}\"\nprintf '%s\\n' \"${0##*/} $*\" "
        ">>\"$OVRIN_TEST_SAYS/calls\"\n"
        "for word in \"$@\" otherwise; do\n"
        "    case $word in */*) continue ;; esac\n"
        "    [ -f \"$own/$word\" ] || continue\n"
        "    [ \"$word\" = --batch ] && read -r request\n"
        "    cat \"$own/$word\"\n    exit \"$(cat \"$own/$word.status\")\"\n"
        "done\necho \"not told: $*\" >&2\nexit 99\n";

    const program::WorkingDirectory m_Folder;
    const Variable m_Path, m_Says;
};

/// A home without settings, in which nothing of the user or the machine reaches git, Mercurial or Subversion.
class EmptyHome {
public:
    EmptyHome() : m_Home("HOME", m_Folder.Path().string()) {}

    const fs::path& Path() const { return m_Folder.Path(); }
    const program::WorkingDirectory& Folder() const { return m_Folder; }

private:
    const program::WorkingDirectory m_Folder;
    const Variable m_Home, m_Config{"XDG_CONFIG_HOME", {}}, m_Global{"GIT_CONFIG_GLOBAL", {}},
        m_System{"GIT_CONFIG_NOSYSTEM", "1"}, m_Git{"GIT_DIR", {}}, m_Index{"GIT_INDEX_FILE", {}},
        m_Tree{"GIT_WORK_TREE", {}}, m_Author{"GIT_AUTHOR_NAME", "A"},
        m_AuthorMail{"GIT_AUTHOR_EMAIL", "a@example.org"}, m_Committer{"GIT_COMMITTER_NAME", "A"},
        m_CommitterMail{"GIT_COMMITTER_EMAIL", "a@example.org"}, m_Mercurial{"HGRCPATH", {}},
        m_Merge{"HGMERGE", {}}, m_Subversion{"SVN_MERGE", {}};
};

} // namespace surroundings
