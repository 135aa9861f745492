// Console commands that make the library's JSON, GUIDs and profiler visible:
//
//   json.check FILE    parse a JSON file and report the shape of its value, or the error
//   json.format FILE   print a JSON file in the library's compact form
//   guid.new           print a new unique GUID
//   profile.dump       print the code profiler's data, one line per profile
//
// Register at start-up, unregister at shut-down, on the console thread.
#pragma once

namespace kelcon {

void RegisterDataCommands();
void UnregisterDataCommands();

}  // namespace kelcon
