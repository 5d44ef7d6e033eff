#pragma once

#include <array>
#include <cstddef>

namespace ovrin {

struct Point {
    double x = 0, y = 0, z = 0;
};

/// The rotation of a Transform, as its file has it; of any length.
struct Quaternion {
    double x = 0, y = 0, z = 0, w = 1;
};

/// A map of space that keeps lines straight: the columns of a matrix and a displacement.
struct Affine {
    std::array<Point, 3> axes = {Point{1, 0, 0}, Point{0, 1, 0}, Point{0, 0, 1}};
    Point origin;

    /// First the scale, then the rotation, then the displacement. A quaternion of no length turns nothing.
    static Affine Of(const Point& displacement, const Quaternion& rotation, const Point& scale);

    /// Where a point comes to stand.
    Point operator()(const Point& point) const;
    /// First `inner`, then this.
    Affine After(const Affine& inner) const;
};

/// Whether all numbers are finite.
bool IsFinite(const Point& point);

} // namespace ovrin
