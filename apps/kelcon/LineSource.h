// Where the console's command lines come from: a terminal with line editing, or a
// stream read line by line (a pipe or a script file).
#pragma once

#include <cstdio>
#include <memory>
#include <string>

namespace kelcon {

class LineSource {
 public:
  virtual ~LineSource() = default;
  // The next line without its line end; false at the end of the input (Ctrl-D on a
  // terminal).
  virtual bool Next(std::string& line) = 0;
};

// Lines of `file` (not owned), a final line without a line end included; "\r\n" ends
// a line as "\n" does.
std::unique_ptr<LineSource> MakeStreamLineSource(std::FILE* file);

// An interactive prompt on the terminal with line editing, history kept in
// `historyPath` (read at start, written at the end; empty: no history file) and Tab
// completion of command names (file names after the first word).
std::unique_ptr<LineSource> MakeTerminalLineSource(const std::string& historyPath);

}  // namespace kelcon
