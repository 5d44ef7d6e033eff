#include "Scenes/SceneFile.h"

#include "FileUtils.h"
#include "SceneExtensions.h"

#include "Reading/DocumentCut.h"

#include <algorithm>
#include <cstring>

namespace ovrin {

namespace {

constexpr std::string_view kLfsSignature = "version https://git-lfs.github.com/spec/";

/// What the lines of a conflict begin with, in their order, and whether words follow.
struct Marker {
    std::string_view line; // with the line end in front of it
    bool hasWords;
};
constexpr Marker kOurs = {"\n<<<<<<< ", true};
constexpr Marker kBase = {"\n||||||| ", true};
constexpr Marker kBetween = {"\n=======", false};
constexpr Marker kTheirs = {"\n>>>>>>> ", true};

bool IsWholeLine(std::string_view rest) {
    return rest.empty() || rest.front() == '\n' || rest.front() == '\r';
}

/// Where the first marker of this kind begins, or npos. The search of the C library is several times as fast
/// as that of std::string_view.
std::size_t Find(std::string_view bytes, const Marker& marker) {
    const std::string_view first = marker.line.substr(1);
    const auto stands = [&](std::size_t at) {
        return marker.hasWords || IsWholeLine(bytes.substr(at + first.size()));
    };
    if (bytes.starts_with(first) && stands(0)) return 0;
    for (std::size_t from = 0;;) {
        const void* found =
            memmem(bytes.data() + from, bytes.size() - from, marker.line.data(), marker.line.size());
        if (!found) return std::string_view::npos;
        const auto at = static_cast<std::size_t>(static_cast<const char*>(found) - bytes.data()) + 1;
        if (stands(at)) return at;
        from = at;
    }
}

bool HoldsConflict(std::string_view bytes) {
    constexpr std::size_t kNone = std::string_view::npos;
    return Find(bytes, kOurs) != kNone && Find(bytes, kBetween) != kNone && Find(bytes, kTheirs) != kNone;
}

} // namespace

std::size_t FindMarker(std::string_view bytes) {
    return std::min({Find(bytes, kOurs), Find(bytes, kBase), Find(bytes, kBetween), Find(bytes, kTheirs)});
}

SceneKind ClassifyScene(std::string_view bytes) {
    if (bytes.empty()) return SceneKind::Empty;
    if (bytes.starts_with(kLfsSignature)) return SceneKind::LfsPointer;
    if (std::memchr(bytes.data(), '\0', bytes.size())) return SceneKind::Binary;
    const bool isScene = ovrin_yaml::HasSignature(bytes);
    const bool hasMarkers = isScene ? FindMarker(bytes) != std::string_view::npos : HoldsConflict(bytes);
    if (hasMarkers) return SceneKind::Markers;
    return isScene ? SceneKind::Scene : SceneKind::NoScene;
}

std::string TellKind(const std::string& name, SceneKind kind) {
    switch (kind) {
    case SceneKind::Empty:
        return name + " is empty: take it from an earlier version, or remove it";
    case SceneKind::Markers:
        return name +
               " holds conflict markers, the leftovers of a merge by lines: take one side's whole file, "
               "or take the merge back and merge again with ovrin";
    case SceneKind::LfsPointer:
        return name + " is a pointer of Git LFS, not the scene itself: get that with \"git lfs pull\"";
    case SceneKind::Binary:
        return name + " is binary: let the editor save scenes as text, and save it again";
    case SceneKind::NoScene:
        return name + " is no scene: it doesn't begin with %YAML; let the editor save it again, or name "
                      "another file";
    case SceneKind::Scene:
        break;
    }
    return name + " is a scene";
}

bool IsSceneName(const std::string& path) {
    return IsSceneExtension(GetFileExtension(path));
}

} // namespace ovrin
