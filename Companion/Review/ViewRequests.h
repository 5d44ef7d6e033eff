#pragma once

#include "Review/PageRequest.h"

#include <optional>

namespace ovrin {

class SceneView;

/// Answers the requests of a page that are about one scene: api/tree, api/find, api/object and api/map.
/// Nothing for any other. A request that can't be answered is told with a status of 400 or more.
std::optional<PageAnswer> AnswerView(SceneView& view, const PageRequest& request);

} // namespace ovrin
