// The type of a value stored in a PropList. The numbers are part of the interface: they
// are what GetPropertyType returns and they never change meaning.
#pragma once

namespace kelcore::proplist {

enum PropListPropertyType : int {
  kPropTypeNone = 0,  // no value under that key
  kPropTypeUnicodeString = 1,
  kPropTypeString = 2,
  kPropTypeBool = 3,
  kPropTypeUInt16 = 4,
  kPropTypeUInt32 = 5,
  kPropTypeInt32 = 6,
  kPropTypeInt64 = 7,
  kPropTypeUInt64 = 8,
  kPropTypeFloat = 9,
  kPropTypeDouble = 10,
  kPropTypePropList = 11,
  kPropTypeUnicodeStringArray = 12,
  kPropTypeStringArray = 13,
  kPropTypeBoolArray = 14,
  kPropTypeUInt16Array = 15,
  kPropTypeUInt32Array = 16,
  kPropTypeInt32Array = 17,
  kPropTypeInt64Array = 18,
  kPropTypeUInt64Array = 19,
  kPropTypeFloatArray = 20,
  kPropTypeDoubleArray = 21,
};

}  // namespace kelcore::proplist
