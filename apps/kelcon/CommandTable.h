// A table of console commands that kelcon registers and unregisters as one group.
#pragma once

#include <kelcore/console/Command.h>
#include <kelcore/console/CommandRegistry.h>

#include <span>

namespace kelcon {

struct CommandEntry {
  const char* name;
  const char* help;
  kelcore::console::CommandFactory factory;
};

// The factory of a command class constructible from (name, help).
template <typename T>
kelcore::console::Command* MakeCommand(const kelcore::UTF16String& name,
                                       const kelcore::UTF16String& help) {
  return new T(name, help);
}

void RegisterCommands(std::span<const CommandEntry> table);
void UnregisterCommands(std::span<const CommandEntry> table);

}  // namespace kelcon
