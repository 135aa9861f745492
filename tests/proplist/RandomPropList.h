// Random PropList trees for tests: every value type, nested lists, empty and non-empty
// arrays, keys and texts with reserved XML characters and non-ASCII text.
//
//   RandomPropListGenerator random(seed);                 // any bits the model holds
//   RandomPropListGenerator random(seed, {.xmlSafe = true});  // only data the XML file
//                                                             // format carries unchanged
//   PropList list = random.Make();
//   random.Mutate(copy);                                  // copy != list afterwards
//
// With xmlSafe, texts hold only characters XML documents can carry and parsers report
// unchanged (no NUL or other C0 control except TAB and LF, no CR, no lone surrogate, no
// U+FFFE/U+FFFF), and floats and doubles are dyadic values with few enough digits to
// survive the writer's 8 and 16 significant digits (no NaN, no infinity; -0 included).
// Without it, texts are arbitrary code units and bytes, and numbers arbitrary bit
// patterns. Keys never hold a NUL, so a generated key is stored as it is.
//
// The sequence depends only on the seed and the options (and on the standard library's
// distributions), so a failing seed can be replayed.
#pragma once

#include <kelcore/proplist/PropList.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <bit>
#include <cstdint>
#include <iterator>
#include <limits>
#include <list>
#include <random>
#include <type_traits>

namespace kelcore::proplist::testing {

struct RandomPropListOptions {
  int maxDepth = 3;        // nesting levels below the top list
  int maxEntries = 6;      // per list
  int maxArrayLength = 4;  // a quarter of all arrays are empty besides
  int maxTextLength = 8;   // code units of a UTF16String, characters of the others
  bool xmlSafe = false;
};

class RandomPropListGenerator {
 public:
  explicit RandomPropListGenerator(std::uint64_t seed, RandomPropListOptions options = {})
      : engine_(seed), options_(options) {}

  PropList Make() {
    PropList list;
    Fill(list, 0);
    return list;
  }

  // Adds random entries to `list`, which sits `depth` levels below the top.
  void Fill(PropList& list, int depth) {
    const int count = Uniform(0, options_.maxEntries);
    for (int i = 0; i < count; ++i) {
      // A fifth of the entries above the deepest level are nested lists.
      const bool nest = depth < options_.maxDepth && Uniform(0, 4) == 0;
      SetRandomValue(list, Key(), nest ? kPropTypePropList : OtherType(kPropTypePropList), depth);
    }
  }

  // Changes `list` so that it no longer compares equal to what it was: adds a key,
  // removes one, changes a value's type, changes a value, or mutates a nested list.
  void Mutate(PropList& list) {
    std::list<UTF8String> names;
    list.GetPropertyNames(names);
    if (names.empty() || Uniform(0, 3) == 0) {
      UTF8String key = Key();
      while (list.GetPropertyType(key) != kPropTypeNone) key.push_back('+');
      SetRandomValue(list, key, static_cast<PropListPropertyType>(Uniform(1, 21)), 0);
      return;
    }
    const UTF8String key = *std::next(names.begin(), Uniform(0, int(names.size()) - 1));
    const PropListPropertyType type = list.GetPropertyType(key);
    switch (Uniform(0, 2)) {
      case 0:
        list.RemoveValue(key);
        break;
      case 1:
        SetRandomValue(list, key, OtherType(type), 0);
        break;
      default:
        ChangeValue(list, key, type);
    }
  }

  UTF8String Key() {
    if (Uniform(0, 9) == 0) return UTF8String();
    UTF8String key = Text8();
    for (unsigned char& byte : key) {
      if (byte == 0) byte = '0';
    }
    return key;
  }

  UTF16String Text16() {
    UTF16String text;
    const int length = Uniform(0, options_.maxTextLength);
    for (int i = 0; i < length; ++i) {
      if (!options_.xmlSafe) {
        text.push_back(static_cast<UTF16Char>(Uniform(0, 0xFFFF)));
        continue;
      }
      // ASCII with the reserved characters, TAB and LF, Latin-1, CJK, U+FFFD, an emoji.
      static constexpr UTF16Char kUnits[] = {
          u'a', u'Z', u'0',  u' ',  u'<',      u'>',      u'&',      u'\'',
          u'"', u'/', u'\t', u'\n', u'\u00E9', u'\u00FF', u'\u4E2D', u'\uFFFD'};
      const int pick = Uniform(0, int(std::size(kUnits)));
      if (pick == int(std::size(kUnits))) {
        text.push_back(UTF16Char(0xD83D));  // U+1F600
        text.push_back(UTF16Char(0xDE00));
      } else {
        text.push_back(kUnits[pick]);
      }
    }
    return text;
  }

  UTF8String Text8() {
    if (options_.xmlSafe) return utility::UTF16to8(Text16());
    UTF8String text;
    const int length = Uniform(0, options_.maxTextLength);
    for (int i = 0; i < length; ++i) text.push_back(static_cast<unsigned char>(Uniform(0, 255)));
    return text;
  }

  template <class T>
  T Value() {
    if constexpr (std::is_same_v<T, UTF16String>) {
      return Text16();
    } else if constexpr (std::is_same_v<T, UTF8String>) {
      return Text8();
    } else if constexpr (std::is_same_v<T, bool>) {
      return Uniform(0, 1) == 1;
    } else if constexpr (std::is_integral_v<T>) {
      using Limits = std::numeric_limits<T>;
      switch (Uniform(0, 5)) {
        case 0:
          return Limits::min();
        case 1:
          return Limits::max();
        case 2:
          return T(0);
        default:
          return std::uniform_int_distribution<T>(Limits::min(), Limits::max())(engine_);
      }
    } else if (Uniform(0, 9) == 0) {
      return T(-0.0);
    } else if (options_.xmlSafe) {
      // k/8 below 2^13 for floats (at most 8 digits), k/16 below 2^32 for doubles.
      constexpr bool kFloat = std::is_same_v<T, float>;
      const std::int64_t limit = kFloat ? (std::int64_t(1) << 16) : (std::int64_t(1) << 36);
      const auto k = std::uniform_int_distribution<std::int64_t>(-limit, limit)(engine_);
      return static_cast<T>(static_cast<double>(k) / (kFloat ? 8.0 : 16.0));
    } else {
      using Bits = std::conditional_t<sizeof(T) == 4, std::uint32_t, std::uint64_t>;
      return std::bit_cast<T>(std::uniform_int_distribution<Bits>()(engine_));
    }
  }

  template <class T>
  std::list<T> Array() {
    std::list<T> values;
    if (Uniform(0, 3) == 0) return values;
    const int length = Uniform(1, options_.maxArrayLength);
    for (int i = 0; i < length; ++i) values.push_back(Value<T>());
    return values;
  }

  // Any value type but `type`.
  PropListPropertyType OtherType(PropListPropertyType type) {
    const int pick = Uniform(1, kPropTypeDoubleArray - 1);
    return static_cast<PropListPropertyType>(pick < type ? pick : pick + 1);
  }

  int Uniform(int low, int high) { return std::uniform_int_distribution<int>(low, high)(engine_); }

 private:
  // Calls f with a value-initialised object of the C++ type that `type` stores (a
  // std::list for the array types); for kPropTypePropList, calls nested().
  template <class F, class Nested>
  static void WithType(PropListPropertyType type, F&& f, Nested&& nested) {
    switch (type) {
      case kPropTypeUnicodeString:
        return f(UTF16String());
      case kPropTypeString:
        return f(UTF8String());
      case kPropTypeBool:
        return f(bool());
      case kPropTypeUInt16:
        return f(std::uint16_t());
      case kPropTypeUInt32:
        return f(std::uint32_t());
      case kPropTypeInt32:
        return f(std::int32_t());
      case kPropTypeInt64:
        return f(std::int64_t());
      case kPropTypeUInt64:
        return f(std::uint64_t());
      case kPropTypeFloat:
        return f(float());
      case kPropTypeDouble:
        return f(double());
      case kPropTypePropList:
        return nested();
      case kPropTypeUnicodeStringArray:
        return f(std::list<UTF16String>());
      case kPropTypeStringArray:
        return f(std::list<UTF8String>());
      case kPropTypeBoolArray:
        return f(std::list<bool>());
      case kPropTypeUInt16Array:
        return f(std::list<std::uint16_t>());
      case kPropTypeUInt32Array:
        return f(std::list<std::uint32_t>());
      case kPropTypeInt32Array:
        return f(std::list<std::int32_t>());
      case kPropTypeInt64Array:
        return f(std::list<std::int64_t>());
      case kPropTypeUInt64Array:
        return f(std::list<std::uint64_t>());
      case kPropTypeFloatArray:
        return f(std::list<float>());
      case kPropTypeDoubleArray:
        return f(std::list<double>());
      case kPropTypeNone:
        return;
    }
  }

  template <class T>
  struct IsList : std::false_type {};
  template <class T>
  struct IsList<std::list<T>> : std::true_type {
    using Element = T;
  };

  void SetRandomValue(PropList& list, const UTF8String& key, PropListPropertyType type, int depth) {
    WithType(
        type,
        [&](auto kind) {
          using T = decltype(kind);
          if constexpr (IsList<T>::value) {
            list.SetValue(key, Array<typename IsList<T>::Element>());
          } else {
            list.SetValue(key, Value<T>());
          }
        },
        [&] {
          PropList* nested = list.NewSubList(key);
          nested->Clear();
          Fill(*nested, depth + 1);
        });
  }

  // Changes the value under `key` but keeps its type.
  void ChangeValue(PropList& list, const UTF8String& key, PropListPropertyType type) {
    WithType(
        type,
        [&](auto value) {
          using T = decltype(value);
          list.GetValue(key, value);
          if constexpr (IsList<T>::value) {
            value.push_back(Value<typename IsList<T>::Element>());
          } else if constexpr (std::is_same_v<T, bool>) {
            value = !value;
          } else if constexpr (std::is_integral_v<T>) {
            value = static_cast<T>(static_cast<std::make_unsigned_t<T>>(value) + 1u);
          } else if constexpr (std::is_floating_point_v<T>) {
            // Small dyadic values stay exact and always change by one; other bit
            // patterns (NaN, infinity, huge values) change in their last bit.
            using Bits = std::conditional_t<sizeof(T) == 4, std::uint32_t, std::uint64_t>;
            value = options_.xmlSafe ? static_cast<T>(value + 1)
                                     : std::bit_cast<T>(std::bit_cast<Bits>(value) ^ Bits(1));
          } else {
            value.push_back('x');
          }
          list.SetValue(key, value);
        },
        [&] { Mutate(*list.GetSubList(key)); });
  }

  std::mt19937_64 engine_;
  RandomPropListOptions options_;
};

}  // namespace kelcore::proplist::testing
