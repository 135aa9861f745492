#include "debug/TraceDatabaseText.h"

#include <algorithm>
#include <cstdio>
#include <limits>

namespace kelcore::debug {

void AppendTraceRecord(UTF8String& text, const UTF8String& name, bool enabled,
                       std::int32_t volume) {
  char number[16];
  const int length = std::snprintf(number, sizeof(number), "%ld", static_cast<long>(volume));
  text.append(name);
  text.push_back('\t');
  text.push_back(enabled ? '1' : '0');
  text.push_back('\t');
  text.append(reinterpret_cast<const unsigned char*>(number), static_cast<std::size_t>(length));
  text.push_back('\n');
}

std::int64_t ParseLeadingInteger(const unsigned char* begin, const unsigned char* end) {
  const unsigned char* p = begin;
  while (p != end && (*p == ' ' || (*p >= '\t' && *p <= '\r'))) ++p;
  bool negative = false;
  if (p != end && (*p == '+' || *p == '-')) {
    negative = *p == '-';
    ++p;
  }
  // Accumulate towards the sign's side so that the most negative value fits.
  constexpr std::int64_t kMin = std::numeric_limits<std::int64_t>::min();
  constexpr std::int64_t kMax = std::numeric_limits<std::int64_t>::max();
  std::int64_t value = 0;
  for (; p != end && *p >= '0' && *p <= '9'; ++p) {
    const int digit = *p - '0';
    if (negative) {
      value = value < (kMin + digit) / 10 ? kMin : value * 10 - digit;
    } else {
      value = value > (kMax - digit) / 10 ? kMax : value * 10 + digit;
    }
  }
  return value;
}

std::vector<TraceRecord> ParseTraceRecords(const UTF8String& text) {
  std::vector<TraceRecord> records;
  const unsigned char* p = text.data();
  const unsigned char* const end = p + text.size();
  for (;;) {
    const unsigned char* nameEnd = std::find(p, end, '\t');
    if (nameEnd == end) break;
    const unsigned char* enabledBegin = nameEnd + 1;
    const unsigned char* enabledEnd = std::find(enabledBegin, end, '\t');
    if (enabledEnd == end) break;
    const unsigned char* volumeBegin = enabledEnd + 1;
    const unsigned char* volumeEnd = std::find(volumeBegin, end, '\n');
    if (volumeEnd == end) break;
    const std::int64_t volume = std::clamp<std::int64_t>(
        ParseLeadingInteger(volumeBegin, volumeEnd), std::numeric_limits<std::int32_t>::min(),
        std::numeric_limits<std::int32_t>::max());
    records.push_back(TraceRecord{UTF8String(p, nameEnd),
                                  ParseLeadingInteger(enabledBegin, enabledEnd) == 1,
                                  static_cast<std::int32_t>(volume)});
    p = volumeEnd + 1;
  }
  return records;
}

}  // namespace kelcore::debug
