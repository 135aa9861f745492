// Natural ordering, compared in place: no chunk is copied and numeric chunks are read as
// the walk passes over them.
#include <kelcore/utility/NaturalCompare.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <limits>

namespace kelcore::utility {
namespace {

// The value 0-9 of a numeric unit (ASCII, Arabic-Indic or full-width digit), or -1.
// The same set as IsNumericChar(unit, true), tested cheaply for the ASCII range.
inline int DigitValue(UTF16Char unit) {
  unsigned offset = static_cast<unsigned>(unit) - u'0';
  if (offset < 10) return static_cast<int>(offset);
  if (unit < 0x0660) return -1;
  offset = static_cast<unsigned>(unit) - 0x0660;
  if (offset < 10) return static_cast<int>(offset);
  offset = static_cast<unsigned>(unit) - 0xFF10;
  if (offset < 10) return static_cast<int>(offset);
  return -1;
}

inline bool IsDigit(UTF16Char unit) {
  return DigitValue(unit) >= 0;
}

struct UnitsAsTheyAre {
  static UTF16Char Fold(UTF16Char unit) { return unit; }
};

struct AsciiLettersFolded {
  static UTF16Char Fold(UTF16Char unit) {
    return static_cast<unsigned>(unit) - u'A' < 26 ? static_cast<UTF16Char>(unit + 0x20) : unit;
  }
};

// Reads the numeric chunk that starts at `pos`, leaving `pos` just after it. The value
// saturates at 2^64-1, as the stream conversion into an unsigned 64-bit integer does.
inline std::uint64_t ReadChunkValue(const UTF16Char* text, std::size_t size, std::size_t& pos) {
  constexpr std::uint64_t kMax = std::numeric_limits<std::uint64_t>::max();
  constexpr std::uint64_t kMaxTenth = kMax / 10;
  constexpr unsigned kMaxLastDigit = static_cast<unsigned>(kMax % 10);
  std::uint64_t value = 0;
  for (; pos < size; ++pos) {
    const int digit = DigitValue(text[pos]);
    if (digit < 0) break;
    if (value > kMaxTenth || (value == kMaxTenth && static_cast<unsigned>(digit) > kMaxLastDigit)) {
      value = kMax;
    } else if (value != kMax) {
      value = value * 10 + static_cast<unsigned>(digit);
    }
  }
  return value;
}

template <typename Folding>
long CompareNaturally(const UTF16String& first, const UTF16String& second) {
  const UTF16Char* a = first.data();
  const UTF16Char* b = second.data();
  const std::size_t sizeA = first.size();
  const std::size_t sizeB = second.size();
  // Identical leading units need no chunk logic. When both texts go on with text units
  // after them, the walk goes on inside that text chunk. Otherwise it starts again at
  // the beginning of the chunk that holds the last identical unit, which is a chunk
  // start in both texts (the chunks before it are identical and compare equal).
  const std::size_t common = std::min(sizeA, sizeB);
  std::size_t i = 0;
  while (i < common && a[i] == b[i]) ++i;
  if (i > 0) {
    const bool numeric = IsDigit(a[i - 1]);
    const bool insideText = !numeric && i < common && !IsDigit(a[i]) && !IsDigit(b[i]);
    if (!insideText) {
      while (i > 0 && IsDigit(a[i - 1]) == numeric) --i;
    }
  }
  std::size_t j = i;
  for (;;) {
    // A missing chunk is empty text, which sorts before any chunk.
    if (i == sizeA) return j == sizeB ? 0 : -1;
    if (j == sizeB) return 1;

    const int digitA = DigitValue(a[i]);
    const int digitB = DigitValue(b[j]);
    if (digitA >= 0 && digitB >= 0) {
      const std::uint64_t valueA = ReadChunkValue(a, sizeA, i);
      const std::uint64_t valueB = ReadChunkValue(b, sizeB, j);
      if (valueA != valueB) return valueA < valueB ? -1 : 1;
      continue;
    }
    if (digitA >= 0 || digitB >= 0) {
      // A numeric chunk against a text chunk: their first units differ, and the numeric
      // one counts as its ASCII digit.
      const UTF16Char unitA =
          digitA >= 0 ? static_cast<UTF16Char>(u'0' + digitA) : Folding::Fold(a[i]);
      const UTF16Char unitB =
          digitB >= 0 ? static_cast<UTF16Char>(u'0' + digitB) : Folding::Fold(b[j]);
      return unitA < unitB ? -1 : 1;
    }
    // Two text chunks, walked together until they differ or one of them ends.
    for (;;) {
      const UTF16Char unitA = Folding::Fold(a[i]);
      const UTF16Char unitB = Folding::Fold(b[j]);
      if (unitA != unitB) return unitA < unitB ? -1 : 1;
      ++i;
      ++j;
      const bool endA = i == sizeA || IsDigit(a[i]);
      const bool endB = j == sizeB || IsDigit(b[j]);
      if (endA || endB) {
        if (!(endA && endB)) return endA ? -1 : 1;
        break;
      }
    }
  }
}

}  // namespace

long NaturalStringCompare(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<UnitsAsTheyAre>(a, b);
}
bool NaturalStringEquals(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<UnitsAsTheyAre>(a, b) == 0;
}
bool NaturalStringLessThan(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<UnitsAsTheyAre>(a, b) < 0;
}

namespace CaseInsensitive {

long NaturalStringCompare(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<AsciiLettersFolded>(a, b);
}
bool NaturalStringEquals(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<AsciiLettersFolded>(a, b) == 0;
}
bool NaturalStringLessThan(const UTF16String& a, const UTF16String& b) {
  return CompareNaturally<AsciiLettersFolded>(a, b) < 0;
}

}  // namespace CaseInsensitive
}  // namespace kelcore::utility
