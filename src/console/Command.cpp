#include <kelcore/console/Command.h>

namespace kelcore::console {

Command::Command(const UTF16String& name, const UTF16String& help) : name_(name), help_(help) {}

Command::~Command() = default;

}  // namespace kelcore::console
