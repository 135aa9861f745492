// What the node classes need to know about each of the ten value types a node holds:
// its scalar and array type numbers, the empty tag that names it as an array's element
// type in XML, and how two values compare.
//
// Floats and doubles compare by bit pattern, so that equal lists store and write the
// same data: a NaN equals a NaN with the same bits, and 0.0 differs from -0.0.
#pragma once

#include <kelcore/proplist/PropListPropertyType.h>
#include <kelcore/utility/StringTypes.h>

#include <bit>
#include <cstdint>

namespace kelcore::proplist {

template <class T>
struct NodeValueTraits;

template <class T, PropListPropertyType Scalar, PropListPropertyType Array>
struct NodeValueTraitsBase {
  static constexpr PropListPropertyType kType = Scalar;
  static constexpr PropListPropertyType kArrayType = Array;
  static bool Same(const T& a, const T& b) { return a == b; }
};

template <>
struct NodeValueTraits<UTF16String>
    : NodeValueTraitsBase<UTF16String, kPropTypeUnicodeString, kPropTypeUnicodeStringArray> {
  static constexpr const char* kEmptyTag = "<ustring/>";
};

template <>
struct NodeValueTraits<UTF8String>
    : NodeValueTraitsBase<UTF8String, kPropTypeString, kPropTypeStringArray> {
  static constexpr const char* kEmptyTag = "<string/>";
};

template <>
struct NodeValueTraits<bool> : NodeValueTraitsBase<bool, kPropTypeBool, kPropTypeBoolArray> {
  static constexpr const char* kEmptyTag = "<bool/>";
};

template <>
struct NodeValueTraits<std::uint16_t>
    : NodeValueTraitsBase<std::uint16_t, kPropTypeUInt16, kPropTypeUInt16Array> {
  static constexpr const char* kEmptyTag = "<int type='unsigned' size='16'/>";
};

template <>
struct NodeValueTraits<std::uint32_t>
    : NodeValueTraitsBase<std::uint32_t, kPropTypeUInt32, kPropTypeUInt32Array> {
  static constexpr const char* kEmptyTag = "<int type='unsigned' size='32'/>";
};

template <>
struct NodeValueTraits<std::int32_t>
    : NodeValueTraitsBase<std::int32_t, kPropTypeInt32, kPropTypeInt32Array> {
  static constexpr const char* kEmptyTag = "<int type='signed' size='32'/>";
};

template <>
struct NodeValueTraits<std::int64_t>
    : NodeValueTraitsBase<std::int64_t, kPropTypeInt64, kPropTypeInt64Array> {
  static constexpr const char* kEmptyTag = "<int type='signed' size='64'/>";
};

template <>
struct NodeValueTraits<std::uint64_t>
    : NodeValueTraitsBase<std::uint64_t, kPropTypeUInt64, kPropTypeUInt64Array> {
  static constexpr const char* kEmptyTag = "<int type='unsigned' size='64'/>";
};

template <>
struct NodeValueTraits<float> : NodeValueTraitsBase<float, kPropTypeFloat, kPropTypeFloatArray> {
  static constexpr const char* kEmptyTag = "<float/>";
  static bool Same(float a, float b) {
    return std::bit_cast<std::uint32_t>(a) == std::bit_cast<std::uint32_t>(b);
  }
};

template <>
struct NodeValueTraits<double>
    : NodeValueTraitsBase<double, kPropTypeDouble, kPropTypeDoubleArray> {
  static constexpr const char* kEmptyTag = "<double/>";
  static bool Same(double a, double b) {
    return std::bit_cast<std::uint64_t>(a) == std::bit_cast<std::uint64_t>(b);
  }
};

}  // namespace kelcore::proplist
