#include <kelcore/proplist/PropListGeometry.h>

#include <array>
#include <cstddef>
#include <list>
#include <stdexcept>

namespace kelcore::proplist::utils {
namespace {

// The first N elements of the array of T under `key`, zeros where there are none.
template <class T, std::size_t N>
std::array<T, N> ReadArray(const UTF8String& key, const PropList* list) {
  std::array<T, N> values{};
  std::list<T> stored;
  if (list == nullptr || !list->GetValue(key, stored)) return values;
  std::size_t i = 0;
  for (auto it = stored.begin(); it != stored.end() && i < N; ++it) values[i++] = *it;
  return values;
}

template <class T>
void WriteArray(const UTF8String& key, std::list<T> values, PropList* list) {
  if (list == nullptr) throw std::invalid_argument("no property list to write the geometry to");
  list->SetValue(key, values);
}

template <class T>
utility::PointT<T> ReadPoint(const UTF8String& key, const PropList* list) {
  const auto values = ReadArray<T, 2>(key, list);
  return {values[0], values[1]};
}

template <class T>
utility::RectT<T> ReadRect(const UTF8String& key, const PropList* list) {
  const auto values = ReadArray<T, 4>(key, list);
  return {values[0], values[1], values[2], values[3]};
}

}  // namespace

utility::Point32 ReadPoint32(const UTF8String& key, const PropList& list) {
  return ReadPoint<std::int32_t>(key, &list);
}

utility::PointF32 ReadPointF32(const UTF8String& key, const PropList* list) {
  return ReadPoint<float>(key, list);
}

utility::Rect32 ReadRect32(const UTF8String& key, const PropList& list) {
  return ReadRect<std::int32_t>(key, &list);
}

utility::RectF32 ReadRectF32(const UTF8String& key, const PropList* list) {
  return ReadRect<float>(key, list);
}

void WritePoint32(const UTF8String& key, const utility::Point32& point, PropList& list) {
  WriteArray<std::int32_t>(key, {point.h, point.v}, &list);
}

void WritePointF32(const UTF8String& key, const utility::PointF32& point, PropList* list) {
  WriteArray<float>(key, {point.h, point.v}, list);
}

void WriteRect32(const UTF8String& key, const utility::Rect32& rect, PropList& list) {
  WriteArray<std::int32_t>(key, {rect.left, rect.top, rect.right, rect.bottom}, &list);
}

void WriteRectF32(const UTF8String& key, const utility::RectF32& rect, PropList* list) {
  WriteArray<float>(key, {rect.left, rect.top, rect.right, rect.bottom}, list);
}

}  // namespace kelcore::proplist::utils
