// The text of "Debug Database.txt": one line per entry, key TAB value TAB default CR LF,
// read back as documented in <kelcore/debug/DebugDatabase.h>.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <vector>

namespace kelcore::debug {

struct DebugDatabaseLine {
  UTF8String key;
  UTF8String value;
  UTF8String defaultValue;
};

void AppendDebugDatabaseLine(UTF8String& text, const UTF8String& key, const UTF8String& value,
                             const UTF8String& defaultValue);

// The lines of `text` that hold at least one TAB, in order.
std::vector<DebugDatabaseLine> ParseDebugDatabaseText(const UTF8String& text);

}  // namespace kelcore::debug
