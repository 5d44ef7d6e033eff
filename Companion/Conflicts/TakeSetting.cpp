#include "Conflicts/TakeSetting.h"

#include "Systems/Process.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <cstdlib>
#include <string>

namespace ovrin {

namespace {

Side SideOf(const std::string& value, const char* setting) {
    try {
        return SideNamed(value);
    } catch (const Failure& failure) {
        throw BadSetting(failure.what() + std::string(" (it stands in ") + setting + ")");
    }
}

/// The value in the configuration; empty if there is none.
std::string Configured(const Repository& repository) {
    const bool isGit = repository.kind == SystemKind::Git;
    const CommandWords command = isGit ? CommandWords{"git", "config", "--get", "ovrin.take"}
                                       : CommandWords{"hg", "config", "ovrin.take"};
    const ProcessResult result = RunProcess(command, {.environment = {{"HGPLAIN", "1"}}});
    constexpr int kUnset = 1;
    if (result.status == kUnset) return {};
    if (!result.Succeeded())
        throw Failure("Cannot read the setting ovrin.take: " + command[0] + " says:\n" + result.errors);
    return result.output.substr(0, result.output.find('\n'));
}

} // namespace

Side SideToTake(const std::optional<Repository>& repository) {
    const char* const wanted = std::getenv("OVRIN_TAKE");
    if (wanted && *wanted) return SideOf(wanted, "OVRIN_TAKE");
    if (!repository || repository->kind == SystemKind::Subversion) return Side::Ours;
    const std::string value = Configured(*repository);
    return value.empty() ? Side::Ours : SideOf(value, "the setting ovrin.take");
}

} // namespace ovrin
