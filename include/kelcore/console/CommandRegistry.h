// The process-wide registry of console commands: an ordered map from command name to
// its help text and the factory that makes the command.
//
// Names are compared exactly, code unit by code unit (so case matters), and listed in
// that order. A command object is made by its factory the first time the command runs
// and kept in the registry for later runs, until the name is unregistered.
//
// Threads: the registry has no lock. Register commands at start-up on one thread and run
// them from one console thread; no other use may overlap a registration.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/console/Command.h>
#include <kelcore/utility/StringTypes.h>

#include <functional>
#include <memory>

namespace kelcore::console {

// Makes a new command, owned by the caller, from its name and help text.
using CommandFactory = Command* (*)(const UTF16String& name, const UTF16String& help);

class KELCORE_API CommandRegistry {
 public:
  struct Record {
    UTF16String name;
    UTF16String help;
    CommandFactory factory = nullptr;
  };

  // Registers `name`. A name that is registered already gets the new help text and
  // factory, and a command object made by the old factory is destroyed. A name that is
  // empty or holds a space (no command line could name it) or a null factory raises
  // std::invalid_argument and changes nothing.
  static void RegisterCommand(const UTF16String& name, const UTF16String& help,
                              CommandFactory factory);
  // Removes `name` and returns the command object made for it, now owned by the caller;
  // null when the name was not registered or its command never ran.
  static std::unique_ptr<Command> UnregisterCommand(const UTF16String& name);

  // The record of `name`, or null. Valid until the registry changes.
  static const Record* FindCommand(const UTF16String& name);
  // The command object for `name`, made by its factory on first use; null when the name
  // is not registered. A factory that returns null raises std::runtime_error. Valid
  // until the name is unregistered or registered again.
  static Command* GetCommand(const UTF16String& name);
  // Calls `visit` for every record in name order. `visit` must not change the registry.
  static void ForEachCommand(const std::function<void(const Record&)>& visit);
};

}  // namespace kelcore::console
