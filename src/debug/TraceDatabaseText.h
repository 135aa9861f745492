// The textual form of the trace database: one record per category,
// "name TAB enabled TAB volume LF", as documented in <kelcore/debug/Trace.h>.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstdint>
#include <vector>

namespace kelcore::debug {

struct TraceRecord {
  UTF8String name;
  bool enabled;
  std::int32_t volume;
};

// Appends one record: the name, TAB, "1" or "0", TAB, the volume in decimal, LF.
void AppendTraceRecord(UTF8String& text, const UTF8String& name, bool enabled, std::int32_t volume);

// The complete records of `text`, in order. A name runs to the next TAB (it may hold
// LFs), the enabled field to the next TAB, the volume field to the next LF; a record
// the text ends in is dropped. Enabled is true when its field's leading integer is 1;
// the volume is its field's leading integer clamped to 32 bits (see ParseLeadingInteger).
std::vector<TraceRecord> ParseTraceRecords(const UTF8String& text);

// The leading base-10 integer of [begin, end) as strtol reads it in the "C" locale:
// leading white space (space, TAB, LF, VT, FF, CR), an optional sign, then digits; the
// rest is ignored. Saturates at the limits of int64; 0 when there are no digits.
std::int64_t ParseLeadingInteger(const unsigned char* begin, const unsigned char* end);

}  // namespace kelcore::debug
