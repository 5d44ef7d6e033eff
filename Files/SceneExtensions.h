#pragma once

#include <span>
#include <string>

/// What the names of object files end in, behind the last dot. Upper and lower case are told apart.
std::span<const char* const> SceneExtensions();

/// Whether `extension` is one of them.
bool IsSceneExtension(const std::string& extension);
