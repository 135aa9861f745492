// Points and rectangles stored in a property list.
//
// A point is stored under its key as an array of two values (h, v), a rectangle as an
// array of four (left, top, right, bottom): signed 32-bit arrays for the 32 forms, float
// arrays for the F32 forms. Writing replaces whatever the key held.
//
// Reading is lenient: an absent key, a value of another type, or a null list gives all
// zeros; an array with fewer elements than needed fills the rest with zeros, and
// elements past the second (fourth) are ignored. Writing into a null list throws
// std::invalid_argument.
//
// The pointer and reference forms of the list follow the established interface; they
// behave alike. Threads: as PropList.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/proplist/PropList.h>
#include <kelcore/utility/Geometry.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::proplist::utils {

KELCORE_API utility::Point32 ReadPoint32(const UTF8String& key, const PropList& list);
KELCORE_API utility::PointF32 ReadPointF32(const UTF8String& key, const PropList* list);
KELCORE_API utility::Rect32 ReadRect32(const UTF8String& key, const PropList& list);
KELCORE_API utility::RectF32 ReadRectF32(const UTF8String& key, const PropList* list);

KELCORE_API void WritePoint32(const UTF8String& key, const utility::Point32& point, PropList& list);
KELCORE_API void WritePointF32(const UTF8String& key, const utility::PointF32& point,
                               PropList* list);
KELCORE_API void WriteRect32(const UTF8String& key, const utility::Rect32& rect, PropList& list);
KELCORE_API void WriteRectF32(const UTF8String& key, const utility::RectF32& rect, PropList* list);

}  // namespace kelcore::proplist::utils
