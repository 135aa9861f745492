// Runs command lines through the console and reports what fails.
#pragma once

#include <kelcore/console/UTF16OutputStream.h>

#include <cstdio>
#include <string>

#include "LineSource.h"

namespace kelcon {

// Runs one line: an empty line or one starting with "#" does nothing; otherwise the line
// goes to the console's ExecuteCommand with its output on `out`. An unknown command or a
// command that raises is reported on `errors` (localized for the library's own errors)
// and the function returns false; the console itself carries on.
bool RunCommandLine(const std::string& line, kelcore::console::UTF16OutputStream& out,
                    std::FILE* errors);

// Runs every line of `source` until its end or `quit`. Returns whether every line ran
// without an error.
bool RunCommandLines(LineSource& source, kelcore::console::UTF16OutputStream& out,
                     std::FILE* errors);

}  // namespace kelcon
