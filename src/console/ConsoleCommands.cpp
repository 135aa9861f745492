#include <kelcore/console/ConsoleCommands.h>

#include <kelcore/console/CommandRegistry.h>

#include <string>

// AttachStandardConsole(): gives the process a console; see CreateStandardConsoleWindow.
#if defined(_WIN32)
#include "win/StandardConsole.inc"
#else
#include "posix/StandardConsole.inc"
#endif

namespace kelcore::console {

bool ExecuteCommand(const UTF16String& line, UTF16OutputStream& out) {
  std::size_t end = line.size();
  if (end > 0 && line[end - 1] == UTF16Char('\n')) --end;
  if (end > 0 && line[end - 1] == UTF16Char('\r')) --end;
  const UTF16Char space = ' ';
  const std::size_t nameStart = line.find_first_not_of(space);
  if (nameStart == UTF16String::npos || nameStart >= end) return false;
  std::size_t nameEnd = line.find(space, nameStart);
  if (nameEnd == UTF16String::npos || nameEnd > end) nameEnd = end;

  Command* command = CommandRegistry::GetCommand(line.substr(nameStart, nameEnd - nameStart));
  if (command == nullptr) return false;
  std::size_t argumentStart = line.find_first_not_of(space, nameEnd);
  if (argumentStart == UTF16String::npos || argumentStart > end) argumentStart = end;
  command->Execute(line.substr(argumentStart, end - argumentStart), out);
  out.Flush();
  return true;
}

void ListCommands(UTF16OutputStream& out) {
  const char* const title = "Currently installed commands.";
  out << title << endl;
  out << std::string(std::char_traits<char>::length(title), '-') << endl;
  CommandRegistry::ForEachCommand(
      [&out](const CommandRegistry::Record& record) { out << record.help << endl; });
  out << endl;
}

bool CreateStandardConsoleWindow() {
  return AttachStandardConsole();
}

}  // namespace kelcore::console
