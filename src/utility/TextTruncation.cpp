#include <kelcore/utility/TextTruncation.h>

#include <algorithm>
#include <cmath>

namespace kelcore::utility {
namespace {

bool IsHighSurrogate(UTF16Char unit) {
  return unit >= 0xD800 && unit <= 0xDBFF;
}

// How many of the first `count` units to keep so that the kept part does not end on a
// high surrogate.
std::size_t HeadLength(const UTF16Char* units, std::size_t count) {
  if (count > 0 && IsHighSurrogate(units[count - 1])) --count;
  return count;
}

// How many of the last `count` units of `units[0, size)` to keep so that the kept part
// does not start just after a high surrogate.
std::size_t TailLength(const UTF16Char* units, std::size_t size, std::size_t count) {
  if (count > 0 && count < size && IsHighSurrogate(units[size - count - 1])) --count;
  return count;
}

// The [offset, length) range of the kept units.
struct KeptRange {
  std::size_t offset;
  std::size_t length;
};

KeptRange RangeToKeep(const UTF16Char* units, std::size_t size, unsigned int limit, bool keepEnd) {
  if (size <= limit) return {0, size};
  if (keepEnd) {
    const std::size_t length = TailLength(units, size, limit);
    return {size - length, length};
  }
  return {0, HeadLength(units, limit)};
}

}  // namespace

UTF16String TruncateStringToNumChars(const UTF16String& text, unsigned int limit, bool keepEnd) {
  const KeptRange kept = RangeToKeep(text.data(), text.size(), limit, keepEnd);
  return text.substr(kept.offset, kept.length);
}

std::vector<UTF16Char> TruncateStringToNumChars(const std::vector<UTF16Char>& text,
                                                unsigned int limit, bool keepEnd) {
  const KeptRange kept = RangeToKeep(text.data(), text.size(), limit, keepEnd);
  const auto first = text.begin() + static_cast<std::ptrdiff_t>(kept.offset);
  return std::vector<UTF16Char>(first, first + static_cast<std::ptrdiff_t>(kept.length));
}

UTF16String TruncateUIStringInMiddle(const UTF16String& text, unsigned int maxUnits,
                                     float position) {
  if (text.size() <= maxUnits) return text;
  if (maxUnits == 0) return UTF16String();
  if (std::isnan(position)) position = 0.5f;
  position = std::clamp(position, 0.0f, 1.0f);

  const std::size_t kept = maxUnits - 1;
  const auto wantedHead = static_cast<std::size_t>(
      std::lround(static_cast<double>(position) * static_cast<double>(kept)));
  const std::size_t head = HeadLength(text.data(), std::min(wantedHead, kept));
  const std::size_t tail = TailLength(text.data(), text.size(), kept - std::min(wantedHead, kept));

  UTF16String out;
  out.reserve(head + 1 + tail);
  out.append(text, 0, head);
  out.push_back(kTruncationEllipsis);
  out.append(text, text.size() - tail, tail);
  return out;
}

}  // namespace kelcore::utility
