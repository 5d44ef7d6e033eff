#include "Settle/PlainValues.h"

#include "Values/YAMLScalar.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

bool IsPlainValue(const OpenConflict& conflict, const RecordPlaces& places) {
    if (conflict.kind != ConflictKind::BothChanged || conflict.path.size() < 3) return false;
    const YAMLScalar* key = conflict.path.back();
    // A star in a path stands for any element, in a decision about it.
    if (key == YAMLScalar::fileID || key == YAMLScalar::guid ||
        std::ranges::count(conflict.path, YAMLScalar::star))
        return false;
    return std::ranges::all_of(places.Find(conflict.record).values,
                               [](const YAMLNode* value) { return AsScalar(value) != nullptr; });
}

} // namespace ovrin
