#pragma once

#include "Values/YAMLScalar.h"

#include <span>
#include <string>
#include <string_view>

namespace ovrin {

/// The text of a path as decisions name it: its elements joined by dots, "734813.MonoBehaviour.m_Brightness".
/// A dot or a backslash within an element has a backslash in front of it.
std::string DecisionPath(std::span<const ovrin_yaml::YAMLScalar* const> path);

/// The path of that text. A backslash stands for what follows it.
ovrin_yaml::Path PathOfDecision(std::string_view text);

} // namespace ovrin
