// The built-in commands that read and set trace volumes and open the console log file.
#pragma once

#include <kelcore/console/Command.h>

namespace kelcore::commands::trace {

// trace.set <category> <volume>: sets the volume; with the category alone, reports it.
class Set final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// trace.get <category>
class Get final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// trace.getcategories: every category of the trace database, in its order.
class GetCategories final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// trace.set.master <volume>
class SetMaster final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// trace.get.master
class GetMaster final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

// trace.createdefaultconsolelogfile: opens the default console log file, creating it
// when it does not exist, and reports its path.
class CreateDefaultConsoleLogFile final : public console::Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, console::UTF16OutputStream& out) override;
};

}  // namespace kelcore::commands::trace
