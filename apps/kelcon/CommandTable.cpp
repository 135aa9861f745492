#include "CommandTable.h"

#include "CommandText.h"

namespace kelcon {

void RegisterCommands(std::span<const CommandEntry> table) {
  for (const CommandEntry& command : table) {
    kelcore::console::CommandRegistry::RegisterCommand(ToUTF16(command.name), ToUTF16(command.help),
                                                       command.factory);
  }
}

void UnregisterCommands(std::span<const CommandEntry> table) {
  for (const CommandEntry& command : table) {
    kelcore::console::CommandRegistry::UnregisterCommand(ToUTF16(command.name));
  }
}

}  // namespace kelcon
