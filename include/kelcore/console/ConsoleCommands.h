// The developer console: running a command line, listing the commands, and the
// library's built-in commands.
//
// Initialize registers the built-in commands, in this order:
//   debug.get <variable path>             the value of a debug database variable
//   debug.list                            the whole debug database
//   debug.set <variable path> = <value>   sets a debug database variable
//   debug.clear                           empties the debug database
//   trace.set <category> <volume>         sets a trace category's volume
//   trace.get <category>                  a trace category's volume
//   trace.getcategories                   every category in the trace database
//   trace.set.master <volume>             sets the master trace volume
//   trace.get.master                      the master trace volume
//   trace.createdefaultconsolelogfile     opens the default console log file
//   filesupport.listdirs                  the well-known directories
//   filesupport.listvols                  the mounted volumes
//   filesupport.file <file path>          tests the file operations on a path
//   filesupport.dir <file path>           tests the directory operations on a path
// Every answer ends with a line end. A built-in command given too few or malformed
// arguments writes its help text as a usage line.
//
// Threads: as the registry (<kelcore/console/CommandRegistry.h>): set up on one thread,
// run commands from one console thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/console/UTF16OutputStream.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::console {

// Registers the fourteen built-in commands (registering them again replaces them).
KELCORE_API void Initialize();
// Unregisters exactly the fourteen built-in names; commands registered by the host stay.
KELCORE_API void Terminate();

// Runs one command line. The first word (up to a space) is the command's name; the text
// after it and the spaces that follow it is the command's argument text. Leading spaces
// and one trailing line end ("\n", "\r\n" or "\r") are ignored. Returns false, writing
// nothing, when the line holds no name or the name is not registered (an exact,
// case-sensitive match); otherwise runs the command, flushes `out` and returns true.
// Exceptions raised by the command pass to the caller.
KELCORE_API bool ExecuteCommand(const UTF16String& line, UTF16OutputStream& out);

// Writes "Currently installed commands.", a line of 29 "-", every command's help text
// in name order, one per line, then an empty line.
KELCORE_API void ListCommands(UTF16OutputStream& out);

// Gives the process a console for the commands. On Windows: allocates a console window,
// reopens the C standard input on it ("CONIN$", mode "rb") and the standard output and
// error on it ("CONOUT$", mode "wb"), and installs a console control handler that lets
// Ctrl+C and Ctrl+Break through to the console instead of ending the process (closing,
// log-off and shut-down events keep their default handling). Elsewhere there is nothing
// to allocate: the console is the process's terminal (its standard input and output),
// and the function does nothing. Returns true when the process has a console afterwards
// (on POSIX always). Safe to call more than once.
KELCORE_API bool CreateStandardConsoleWindow();

}  // namespace kelcore::console
