#include "Doctor/Examination.h"

#include "Doctor/GitChecks.h"
#include "Doctor/MachineChecks.h"
#include "Doctor/Patient.h"
#include "Doctor/SceneChecks.h"
#include "Systems/Operation.h"
#include "Words/Failure.h"

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

void CheckAtRest(const Patient& patient) {
    if (patient.Around() && IsAtWork(*patient.Around()))
        throw Failure("version control is at work here, as " + LockOf(*patient.Around()) +
                      " says: try again when it is done, or remove that file if it was left behind");
}

/// What version control is in the midst of looks like something that is wrong.
Diagnosis LookAtRest(const Check& check, Patient& patient) {
    CheckAtRest(patient);
    patient.Forget();
    Diagnosis diagnosis = Look(check, patient);
    CheckAtRest(patient);
    return diagnosis;
}

/// The diagnosis after the fix, or the old one with the reason why it can't be fixed.
Diagnosis Fixed(const Check& check, const Diagnosis& problem, Patient& patient) {
    try {
        Diagnosis still = LookAtRest(check, patient);
        if (still.health != Health::Problem || !still.fix) return still;
        const std::string done = still.fix();
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
    constexpr const char* kNames[] = {"ok", "note", "problem", "fixed", "skipped", "unknown"};
    return kNames[static_cast<std::size_t>(health)];
}

} // namespace ovrin
