// DefaultTraceHandler: the built-in end of every trace handler chain.
//
// Writes each message to the debugger's output when a debugger is attached (as
// DebugTrace), then to the console log file (ConsoleLogFile::WriteToLog(message, true)),
// which opens the default log on its first write once the client's name is known.
// Stateless and thread-safe. The log file swallows its own failures, so a message that
// cannot be written is lost silently; an allocation failure still reaches the caller.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/debug/TraceHandler.h>

namespace kelcore::debug {

class KELCORE_API DefaultTraceHandler : public TraceHandler {
 public:
  // The instance that GetMasterTraceHandler() returns when no handler is installed; it
  // is never destroyed, so tracing works during static destruction.
  static DefaultTraceHandler& Instance();

  void HandleTrace(const UTF8String& message) override;
};

}  // namespace kelcore::debug
