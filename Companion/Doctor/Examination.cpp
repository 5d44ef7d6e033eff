#include "Doctor/Examination.h"

#include "Doctor/GitChecks.h"
#include "Doctor/MachineChecks.h"
#include "Doctor/Patient.h"
#include "Doctor/SceneChecks.h"

#include <exception>

namespace ovrin {

namespace {

struct Check {
    const char* code;
    Diagnosis (*look)(Patient& patient);
};

/// What one fix puts right others may build upon: old lines go before the driver is looked at.
constexpr Check kChecks[] = {
    {"git-version", LookAtGitVersion},
    {"old-setup", LookAtOldSetup},
    {"git-driver", LookAtGitDriver},
    {"git-attributes", LookAtGitAttributes},
    {"git-path", LookAtGitPath},
    {"guard", LookAtGuard},
    {"mercurial", LookAtMercurial},
    {"subversion", LookAtSubversion},
    {"line-ends", LookAtLineEnds},
    {"lfs", LookAtLfs},
    {"tag-authority", LookAtTagAuthority},
    {"merge-tools", LookAtMergeTools},
    {"temporary-files", LookAtTemporaryFiles},
    {"open-conflicts", LookAtOpenConflicts},
};

Diagnosis Look(const Check& check, Patient& patient) {
    try {
        return check.look(patient);
    } catch (const std::exception& failure) {
        return {Health::Unknown, "this could not be looked at: " + std::string(failure.what())};
    }
}

/// The diagnosis after the fix, or the old one with the reason why it can't be fixed.
Diagnosis Fixed(const Check& check, const Diagnosis& problem, Patient& patient) {
    try {
        const std::string done = problem.fix();
        patient.Forget();
        Diagnosis after = Look(check, patient);
        if (after.health != Health::Fine && after.health != Health::Note && after.health != Health::Skipped)
            return after;
        return {Health::Fixed, done + ". Before: " + problem.text};
    } catch (const std::exception& failure) {
        return {Health::Problem, problem.text + "; it can't be fixed: " + failure.what(), problem.cure};
    }
}

} // namespace

std::vector<Examined> Examine(bool fix) {
    Patient patient;
    std::vector<Examined> results;
    for (const Check& check : kChecks) {
        Diagnosis diagnosis = Look(check, patient);
        if (fix && diagnosis.health == Health::Problem && diagnosis.fix)
            diagnosis = Fixed(check, diagnosis, patient);
        results.push_back({check.code, std::move(diagnosis)});
    }
    return results;
}

const char* HealthName(Health health) {
    switch (health) {
    case Health::Fine:
        return "ok";
    case Health::Note:
        return "note";
    case Health::Problem:
        return "problem";
    case Health::Fixed:
        return "fixed";
    case Health::Skipped:
        return "skipped";
    case Health::Unknown:
        return "unknown";
    }
    return "";
}

} // namespace ovrin
