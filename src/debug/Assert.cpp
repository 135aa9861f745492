#include <kelcore/debug/Assert.h>

#include "debug/DebugOutput.h"

#include <string>

namespace kelcore::debug {
namespace {

const char* OrEmpty(const char* text) {
  return text != nullptr ? text : "";
}

std::string FormatReport(const char* expression, const char* file, int line, const char* function,
                         const char* message, bool debuggerAttached) {
  std::string report = "kelcore: assertion failed: ";
  report += OrEmpty(expression);
  report += "\n  function: ";
  report += OrEmpty(function);
  report += "\n  file: ";
  report += OrEmpty(file);
  report += ", line ";
  report += std::to_string(line);
  if (message != nullptr && *message != '\0') {
    report += "\n  message: ";
    report += message;
  }
  report += debuggerAttached ? "\n  debugger: attached\n" : "\n  debugger: none\n";
  return report;
}

}  // namespace

void ReportAssertion(const char* expression, const char* file, int line, const char* function,
                     const char* message) noexcept {
  const bool debuggerAttached = IsDebuggerAttached();
  try {
    DebugOutput(FormatReport(expression, file, line, function, message, debuggerAttached));
  } catch (...) {
    DebugOutput("kelcore: assertion failed (no memory to describe it)\n");
  }
}

}  // namespace kelcore::debug
