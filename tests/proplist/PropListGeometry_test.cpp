#include <kelcore/proplist/PropListGeometry.h>

#include <gtest/gtest.h>

#include <list>
#include <stdexcept>

#include "PropListTestSupport.h"

namespace kelcore::proplist {
namespace {

using namespace utils;
using utility::Point32;
using utility::PointF32;
using utility::Rect32;
using utility::RectF32;

TEST(PropListGeometry, StoresFieldsAsArraysInFieldOrder) {
  PropList list;
  WritePoint32(U8("p"), Point32{1, -2}, list);
  WritePointF32(U8("pf"), PointF32{0.5f, -1.25f}, &list);
  WriteRect32(U8("r"), Rect32{10, 20, 30, 40}, list);
  WriteRectF32(U8("rf"), RectF32{1.5f, 2.5f, 3.5f, 4.5f}, &list);

  std::list<std::int32_t> ints;
  ASSERT_TRUE(list.GetValue(U8("r"), ints));
  EXPECT_EQ(ints, (std::list<std::int32_t>{10, 20, 30, 40}));
  std::list<float> floats;
  ASSERT_TRUE(list.GetValue(U8("pf"), floats));
  EXPECT_EQ(floats, (std::list<float>{0.5f, -1.25f}));

  EXPECT_EQ(ReadPoint32(U8("p"), list), (Point32{1, -2}));
  EXPECT_EQ(ReadPointF32(U8("pf"), &list), (PointF32{0.5f, -1.25f}));
  EXPECT_EQ(ReadRect32(U8("r"), list), (Rect32{10, 20, 30, 40}));
  EXPECT_EQ(ReadRectF32(U8("rf"), &list), (RectF32{1.5f, 2.5f, 3.5f, 4.5f}));
}

TEST(PropListGeometry, MissingOrMismatchedValuesReadAsZeros) {
  PropList list;
  list.SetValue(U8("floats"), std::list<float>{1, 2, 3, 4});
  list.SetValue(U8("short"), std::list<std::int32_t>{7});
  list.SetValue(U8("long"), std::list<std::int32_t>{1, 2, 3, 4, 5});
  EXPECT_EQ(ReadRect32(U8("absent"), list), Rect32{});
  EXPECT_EQ(ReadRect32(U8("floats"), list), Rect32{}) << "float array is not int32";
  EXPECT_EQ(ReadPointF32(U8("short"), &list), PointF32{});
  EXPECT_EQ(ReadRect32(U8("short"), list), (Rect32{7, 0, 0, 0}));
  EXPECT_EQ(ReadPoint32(U8("long"), list), (Point32{1, 2}));
  EXPECT_EQ(ReadRectF32(U8("floats"), nullptr), RectF32{});
  EXPECT_THROW(WriteRectF32(U8("x"), RectF32{}, nullptr), std::invalid_argument);
}

}  // namespace
}  // namespace kelcore::proplist
