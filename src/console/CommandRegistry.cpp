#include <kelcore/console/CommandRegistry.h>

#include <map>
#include <stdexcept>
#include <utility>

namespace kelcore::console {

namespace {

struct Entry {
  CommandRegistry::Record record;
  std::unique_ptr<Command> command;  // made on the first run
};

// Never destroyed, so that a host may still unregister commands during static
// destruction.
std::map<UTF16String, Entry>& Registry() {
  static auto* registry = new std::map<UTF16String, Entry>();
  return *registry;
}

}  // namespace

void CommandRegistry::RegisterCommand(const UTF16String& name, const UTF16String& help,
                                      CommandFactory factory) {
  if (name.empty() || name.find(UTF16Char(' ')) != UTF16String::npos) {
    throw std::invalid_argument("RegisterCommand: a command name must be one word");
  }
  if (factory == nullptr) throw std::invalid_argument("RegisterCommand: null factory");
  Entry& entry = Registry()[name];
  entry.record = Record{name, help, factory};
  entry.command.reset();
}

std::unique_ptr<Command> CommandRegistry::UnregisterCommand(const UTF16String& name) {
  auto& registry = Registry();
  const auto found = registry.find(name);
  if (found == registry.end()) return nullptr;
  std::unique_ptr<Command> command = std::move(found->second.command);
  registry.erase(found);
  return command;
}

const CommandRegistry::Record* CommandRegistry::FindCommand(const UTF16String& name) {
  auto& registry = Registry();
  const auto found = registry.find(name);
  return found == registry.end() ? nullptr : &found->second.record;
}

Command* CommandRegistry::GetCommand(const UTF16String& name) {
  auto& registry = Registry();
  const auto found = registry.find(name);
  if (found == registry.end()) return nullptr;
  Entry& entry = found->second;
  if (entry.command == nullptr) {
    entry.command.reset(entry.record.factory(entry.record.name, entry.record.help));
    if (entry.command == nullptr) {
      throw std::runtime_error("GetCommand: the command's factory made no command");
    }
  }
  return entry.command.get();
}

void CommandRegistry::ForEachCommand(const std::function<void(const Record&)>& visit) {
  for (const auto& [name, entry] : Registry()) visit(entry.record);
}

}  // namespace kelcore::console
