// The library's debug output: where assertion reports (and later other diagnostics)
// are written.
#pragma once

#include <string_view>

namespace kelcore::debug {

// Writes `text` to standard error with one write (so concurrent texts never
// interleave) and, on Windows, to the attached debugger. Any thread; never throws.
void DebugOutput(std::string_view text) noexcept;

// True when a debugger is tracing the process now. Any thread; never throws.
bool IsDebuggerAttached() noexcept;

}  // namespace kelcore::debug
