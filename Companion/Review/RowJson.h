#pragma once

#include "Review/ObjectRows.h"

#include <nlohmann/json_fwd.hpp>

namespace ovrin {

/// A row for a page, as Review/ObjectPage.h has it. `names` are those of base, ours, theirs and the result.
nlohmann::json RowJson(const ObjectRow& row, const std::array<const ObjectNames*, 4>& names);

} // namespace ovrin
