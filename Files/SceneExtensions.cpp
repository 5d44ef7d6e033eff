#include "SceneExtensions.h"

#include <algorithm>

std::span<const char* const> SceneExtensions() {
    static constexpr const char* kExtensions[] = {"ovrin", "prefab", "meta", "OVR", "PRE", "MET"};
    return kExtensions;
}

bool IsSceneExtension(const std::string& extension) {
    return std::ranges::find(SceneExtensions(), extension) != SceneExtensions().end();
}
