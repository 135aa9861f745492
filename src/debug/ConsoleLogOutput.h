// The trace system's way into the console log file, kept in one place so that the
// handlers need not know the log's interface.
#pragma once

#include <kelcore/utility/StringTypes.h>

#include <cstdint>

namespace kelcore::debug {

// ConsoleLogFile::WriteToLog(message, true).
void WriteTraceToConsoleLog(const UTF8String& message);

// What RollingTraceHandler needs of the console log file.
bool ConsoleLogIsOpen();
// The size in bytes of the open log; 0 when none is open or its size cannot be had.
std::uint64_t ConsoleLogSize();
// Closes the open log (with its footer) and opens the default log afresh, creating it.
void RollConsoleLog();
// Makes the console log file name its logs with time stamps.
void UseTimestampedConsoleLogNames();

}  // namespace kelcore::debug
