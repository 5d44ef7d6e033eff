#include "Setup/SetupRun.h"

#include "Setup/ConfigChange.h"
#include "Setup/GitSetup.h"
#include "Setup/OtherSetups.h"
#include "Systems/Process.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <sstream>
#include <vector>

namespace ovrin {

namespace {

using Kind = ConfigChange::Kind;

std::string NameOf(SystemKind kind) {
    switch (kind) {
    case SystemKind::Git:
        return "git";
    case SystemKind::Mercurial:
        return "hg";
    case SystemKind::Subversion:
        return "svn";
    }
    return {};
}

void CheckNamed(const SetupWish& wish) {
    if (FindProgram(wish.system).empty() && (!wish.isUndo || wish.scope == Scope::Local))
        throw Failure(wish.system + " is not installed, or not on the path: there is nothing to set up");
    if (wish.system == "svn" && wish.scope == Scope::Local)
        throw Failure("Subversion has no configuration of a single working copy: leave --local out");
}

/// Of all systems those that are installed; with --local that of the repository. What is to be taken back may
/// be there without the system.
std::vector<std::string> WantedSystems(const SetupWish& wish) {
    if (!wish.system.empty()) {
        CheckNamed(wish);
        return {wish.system};
    }
    if (wish.scope == Scope::Local) {
        const auto repository = FindRepository();
        if (!repository)
            throw Failure("There is no repository around this folder: go into one, or leave --local out");
        SetupWish named = wish;
        named.system = NameOf(repository->kind);
        CheckNamed(named);
        return {named.system};
    }
    std::vector<std::string> systems;
    for (const char* system : {"git", "hg", "svn"})
        if (!FindProgram(system).empty() || wish.isUndo) systems.emplace_back(system);
    if (systems.empty()) throw Failure("None of git, hg and svn is installed: there is nothing to set up");
    return systems;
}

SystemSetup SetupFor(const std::string& system, const SetupWish& wish, const ProgramCall& program) {
    if (system == "git")
        return wish.isUndo ? RemovalFromGit(wish.scope, program) : SetupOfGit(wish.scope, program);
    if (system == "hg")
        return wish.isUndo ? RemovalFromMercurial(wish.scope, program)
                           : SetupOfMercurial(wish.scope, program);
    return wish.isUndo ? RemovalFromSubversion(program) : SetupOfSubversion(program);
}

std::string Indented(const std::string& lines) {
    std::istringstream stream(lines);
    std::string text;
    for (std::string line; std::getline(stream, line);) text += "    " + line + '\n';
    return text;
}

std::string Told(const ConfigChange& change) {
    switch (change.kind) {
    case Kind::None:
        return change.path + " has its lines already\n";
    case Kind::Make:
        return change.path + " is made, with these lines:\n" + Indented(change.lines);
    case Kind::Add:
        return change.path + " gets these lines:\n" + Indented(change.lines);
    case Kind::Replace:
        return change.path + " gets these lines, in place of earlier ones:\n" + Indented(change.lines);
    case Kind::Remove:
        return change.path + " loses these lines:\n" + Indented(change.lines);
    case Kind::Delete:
        return change.path + " is removed, with these lines:\n" + Indented(change.lines);
    }
    return {};
}

/// One run, which collects what it has to say.
class Run {
public:
    explicit Run(const SetupWish& wish) : m_Wish(wish), m_Program(CallOfThisProgram(wish.program)) {}

    SetupReport All() {
        for (const std::string& system : WantedSystems(m_Wish)) Attempt(system, [&] { SetUp(system); });
        if (m_Wish.isUndo && m_Report.changed.empty() && m_Report.failures == 0)
            m_Report.words += "There is nothing that setup wrote here.\n";
        return std::move(m_Report);
    }

private:
    /// One failure stops neither other files nor other systems.
    template <class Step> void Attempt(const std::string& system, const Step& step) {
        try {
            step();
        } catch (const std::exception& failure) {
            Refuse(system, failure.what());
        }
    }

    void Say(const std::string& system, const std::string& words) {
        m_Report.words.append(system).append(": ").append(words) += '\n';
    }

    void Refuse(const std::string& system, const std::string& reason) {
        ++m_Report.failures;
        Say(system, reason);
    }

    void SetUp(const std::string& system) {
        const SystemSetup setup = SetupFor(system, m_Wish, m_Program);
        for (const Configuration& file : setup.files) Attempt(system, [&] { Change(file); });
        for (const std::string& reason : setup.refused) Refuse(system, reason);
        for (const std::string& notice : setup.notices) Say(system, notice);
    }

    void Change(const Configuration& file) {
        const ConfigChange change = m_Wish.isUndo ? PlanRemoval(file) : PlanLines(file);
        if (m_Wish.isUndo && change.kind == Kind::None) return;
        if (!m_Wish.isDryRun) CarryOut(change);
        m_Report.done += file.system + ": " + Told(change);
        if (change.kind != Kind::None) m_Report.changed.push_back(change.path);
        if (!change.kept.empty())
            m_Report.words += file.system + ": " + change.path +
                              " keeps what somebody else wrote among them:\n" + Indented(change.kept);
    }

    const SetupWish& m_Wish;
    const ProgramCall m_Program;
    SetupReport m_Report;
};

} // namespace

SetupReport RunSetup(const SetupWish& wish) {
    return Run(wish).All();
}

} // namespace ovrin
