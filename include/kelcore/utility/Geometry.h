// Plain points and rectangles with coordinates of type T (std::int32_t, float, ...).
//
// A point holds its horizontal then vertical coordinate; a rectangle its left, top,
// right and bottom edges, in that order. The field order is the order in which they are
// stored elsewhere (property lists keep them as arrays in this order). No invariant is
// kept: a rectangle may be empty or inverted (right < left), and nothing is normalised.
#pragma once

#include <cstdint>

namespace kelcore::utility {

template <class T>
struct PointT {
  T h{};
  T v{};

  friend bool operator==(const PointT&, const PointT&) = default;
};

template <class T>
struct RectT {
  T left{};
  T top{};
  T right{};
  T bottom{};

  T Width() const { return right - left; }
  T Height() const { return bottom - top; }

  friend bool operator==(const RectT&, const RectT&) = default;
};

}  // namespace kelcore::utility

namespace kelcore::utility {

using Point32 = PointT<std::int32_t>;
using PointF32 = PointT<float>;
using Rect32 = RectT<std::int32_t>;
using RectF32 = RectT<float>;

}  // namespace kelcore::utility
