// The console commands that kelcon adds to the library's built-ins: help and quit, and
// commands that make the library's property lists visible.
//
//   help                              every registered command with its help text
//   quit                              leave the console
//   plist.print FILE                  load a property list and print it in its XML form
//   plist.set FILE KEY TYPE VALUE     set one value and save the list (made if missing)
//
// Register at start-up, unregister at shut-down, on the console thread.
#pragma once

namespace kelcon {

void RegisterHostCommands();
void UnregisterHostCommands();

// Whether `quit` has run since the commands were registered.
bool QuitRequested();

}  // namespace kelcon
