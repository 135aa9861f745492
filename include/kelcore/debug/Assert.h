// Reporting failed assertions and broken contracts.
//
// ReportAssertion describes a failed check (the expression text, the source file, the
// line, the function and an optional message) on the debug output and returns: the
// caller always goes on. The debug output is standard error (and, on Windows, the
// attached debugger); the report says whether a debugger is attached. Each report is
// written with one call, so reports from different threads never interleave.
//
// Any thread may report at any time, including during static construction and
// destruction. A null text argument is shown as empty. Reporting never throws: if the
// report text cannot be built for lack of memory, a shorter fixed text is written.
#pragma once

#include <kelcore/Export.h>

namespace kelcore::debug {

KELCORE_API void ReportAssertion(const char* expression, const char* file, int line,
                                 const char* function, const char* message = nullptr) noexcept;

}  // namespace kelcore::debug

// Checks `expression` and reports it when it is false; the program goes on either way.
#define KELCORE_ASSERT(expression)     \
  ((expression) ? static_cast<void>(0) \
                : ::kelcore::debug::ReportAssertion(#expression, __FILE__, __LINE__, __func__))

// As KELCORE_ASSERT, with a message (a C string) added to the report.
#define KELCORE_ASSERT_MSG(expression, message) \
  ((expression)                                 \
       ? static_cast<void>(0)                   \
       : ::kelcore::debug::ReportAssertion(#expression, __FILE__, __LINE__, __func__, (message)))
