#include "Review/Affine.h"

#include <cmath>

namespace ovrin {

namespace {

Point Scaled(const Point& point, double by) {
    return {point.x * by, point.y * by, point.z * by};
}

Point Sum(const Point& one, const Point& other) {
    return {one.x + other.x, one.y + other.y, one.z + other.z};
}

} // namespace

Affine Affine::Of(const Point& displacement, const Quaternion& rotation, const Point& scale) {
    // Unlike the root of the squares it is neither without end nor nothing where the numbers aren't.
    const double length = std::hypot(std::hypot(rotation.x, rotation.y), std::hypot(rotation.z, rotation.w));
    const bool isNone = length == 0;
    const double x = isNone ? 0 : rotation.x / length, y = isNone ? 0 : rotation.y / length,
                 z = isNone ? 0 : rotation.z / length, w = isNone ? 1 : rotation.w / length;
    return {{Scaled({1 - 2 * (y * y + z * z), 2 * (x * y + z * w), 2 * (x * z - y * w)}, scale.x),
             Scaled({2 * (x * y - z * w), 1 - 2 * (x * x + z * z), 2 * (y * z + x * w)}, scale.y),
             Scaled({2 * (x * z + y * w), 2 * (y * z - x * w), 1 - 2 * (x * x + y * y)}, scale.z)},
            displacement};
}

Point Affine::operator()(const Point& point) const {
    const Point turned =
        Sum(Scaled(axes[0], point.x), Sum(Scaled(axes[1], point.y), Scaled(axes[2], point.z)));
    return Sum(turned, origin);
}

Affine Affine::After(const Affine& inner) const {
    Affine whole;
    const Affine turn = {axes, {}};
    for (std::size_t i = 0; i < axes.size(); ++i) whole.axes[i] = turn(inner.axes[i]);
    whole.origin = (*this)(inner.origin);
    return whole;
}

bool IsFinite(const Point& point) {
    return std::isfinite(point.x) && std::isfinite(point.y) && std::isfinite(point.z);
}

} // namespace ovrin
