#pragma once

#include "Names/ObjectNames.h"

#include <cstdint>
#include <span>
#include <vector>

namespace ovrin {

/// Where an object stands among others.
struct HierarchyPlace {
    static constexpr std::uint32_t kNone = ~std::uint32_t{0};

    std::uint32_t rank;  ///< in the order of the hierarchy, to sort by
    std::uint32_t above; ///< index among the ids of what it stands under; kNone where that isn't one of them
};

/// For each of `ids`, all different, its place by these rules: a GameObject stands ahead of its
/// components, these, in the order of its list, ahead of the GameObjects below it, and those in the order of
/// m_Children. What stands under nothing goes by its place in the file.
///
/// Of several trees the first that has an object says where it stands; what none has comes last, in the order
/// of `ids`. The time goes by the number of ids, of what stands above them and of the children there; the
/// list of objects of each file is gone through once.
std::vector<HierarchyPlace> HierarchyPlaces(std::span<const ObjectNames* const> trees,
                                            std::span<const ovrin_yaml::YAMLScalar* const> ids);

/// The ranks alone; equal ids have equal ranks.
std::vector<std::uint32_t> HierarchyRanks(std::span<const ObjectNames* const> trees,
                                          std::span<const ovrin_yaml::YAMLScalar* const> ids);

} // namespace ovrin
