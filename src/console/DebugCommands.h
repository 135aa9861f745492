// The built-in commands that read and change the debug database.
#pragma once

#include <kelcore/console/Command.h>

namespace kelcore::commands::debug {

// debug.get <variable path>: writes "<path> = <value>", or "<path> is not in the debug
// database." when there is no such entry.
class Get final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// debug.list: writes "Debug Database:", then "<path> = <value>" for every entry in key
// order.
class List final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// debug.set <variable path> = <value>: the path is the text before the first '=' and the
// value the text after it, both without surrounding spaces (an empty value is allowed);
// writes "<path> = <value>". Without '=' or without a path it writes its help text.
class Set final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// debug.clear: removes every entry and writes "Debug database cleared."
class Clear final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

}  // namespace kelcore::commands::debug
