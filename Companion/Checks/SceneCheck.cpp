#include "Checks/SceneCheck.h"

#include "Checks/FaultWords.h"
#include "Checks/ObjectChecks.h"
#include "Checks/OutlineReader.h"
#include "Scenes/SceneFile.h"

#include "Session/MergeError.h"

#include <algorithm>

namespace ovrin {

using ovrin_yaml::MergeError;
using ovrin_yaml::YAMLError;

namespace {

Code CodeOf(SceneKind kind) {
    switch (kind) {
    case SceneKind::Markers:
        return Code::ConflictMarkers;
    case SceneKind::LfsPointer:
        return Code::LfsPointer;
    case SceneKind::Binary:
        return Code::Binary;
    case SceneKind::Empty:
        return Code::Empty;
    default:
        return Code::NoScene;
    }
}

Finding TellNoScene(const std::string& bytes, SceneKind kind) {
    Finding finding{CodeOf(kind)};
    if (kind == SceneKind::Markers) {
        const auto marker = bytes.begin() + static_cast<std::ptrdiff_t>(FindMarker(bytes));
        finding.line = static_cast<std::size_t>(std::count(bytes.begin(), marker, '\n')) + 1;
    }
    finding.message = TellKind("the file", kind);
    return finding;
}

Finding TellUnreadable(const YAMLError& error, const std::string& reason) {
    Finding finding{Code::Unreadable, error.Line(), error.Object()};
    finding.detail = reason;
    finding.message = "can't be read: " + reason + kCureOfUnreadable;
    return finding;
}

} // namespace

std::vector<Finding> CheckScene(const std::string& bytes, const ovrin_yaml::YAMLTypeInfoManager& types) {
    const SceneKind kind = ClassifyScene(bytes);
    if (kind != SceneKind::Scene) return {TellNoScene(bytes, kind)};
    try {
        const Outlines outlines = ReadOutlines(bytes);
        const std::vector<ObjectFault> faults = CheckObjects(outlines, types);
        if (faults.empty()) return {};
        return FaultWords(bytes, outlines, types).Tell(faults);
    } catch (const MergeError& error) {
        return {TellUnreadable(error, error.reason)};
    } catch (const YAMLError& error) {
        return {TellUnreadable(error, error.what())};
    }
}

} // namespace ovrin
