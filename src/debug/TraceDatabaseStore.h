// Where the trace manager keeps the textual form of its database between runs.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <memory>

namespace kelcore::debug {

class TraceDatabaseStore {
 public:
  virtual ~TraceDatabaseStore() = default;
  // The saved text; empty when there is none or it cannot be read.
  virtual UTF8String Read() = 0;
  // Replaces the saved text. Failures are swallowed: tracing code never hears of them.
  virtual void Write(const UTF8String& text) = 0;
};

// "Trace Database.txt" in Dir::PrefDir(), whose path is found again on every use.
std::unique_ptr<TraceDatabaseStore> MakeTraceDatabaseFileStore();

}  // namespace kelcore::debug
