#include <kelcore/debug/DefaultTraceHandler.h>

#include "debug/ConsoleLogOutput.h"

#include <kelcore/debug/Trace.h>

namespace kelcore::debug {

DefaultTraceHandler& DefaultTraceHandler::Instance() {
  static DefaultTraceHandler* const instance = new DefaultTraceHandler;
  return *instance;
}

void DefaultTraceHandler::HandleTrace(const UTF8String& message) {
  DebugTrace(message.c_str());
  WriteTraceToConsoleLog(message);
}

}  // namespace kelcore::debug
