#include "debug/ConsoleLogOutput.h"

#include <kelcore/filesupport/File.h>
#include <kelcore/logging/ConsoleLogFile.h>

#include <string>

namespace kelcore::debug {

using console::ConsoleLogFile;

void WriteTraceToConsoleLog(const UTF8String& message) {
  ConsoleLogFile::GetInstance().WriteToLog(message, true);
}

bool ConsoleLogIsOpen() {
  return ConsoleLogFile::GetInstance().Exists();
}

std::uint64_t ConsoleLogSize() {
  UTF8String path;
  if (!ConsoleLogFile::GetInstance().GetCurrentLogFilePath(path)) return 0;
  try {
    const std::int64_t size = filesupport::File(std::string(path.begin(), path.end())).Size();
    return size > 0 ? static_cast<std::uint64_t>(size) : 0;
  } catch (...) {
    return 0;
  }
}

void RollConsoleLog() {
  ConsoleLogFile::GetInstance().OpenDefaultLogFile(true);
}

void UseTimestampedConsoleLogNames() {
  ConsoleLogFile::SetDefaultLogFileNameFn(&ConsoleLogFile::GetTimestampedLogFileName);
}

}  // namespace kelcore::debug
