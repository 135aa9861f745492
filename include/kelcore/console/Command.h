// Command: the base of every console command.
//
// A command is made by its factory (see <kelcore/console/CommandRegistry.h>) with its
// name and help text, and run with the text that followed its name on the command line.
// It writes its whole answer to the output stream it is given.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/console/UTF16OutputStream.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::console {

class KELCORE_API Command {
 public:
  Command(const UTF16String& name, const UTF16String& help);
  virtual ~Command();

  // Runs the command. `arguments` is the line's text after the command's name and the
  // spaces that follow it (possibly empty); commands split it further themselves. What
  // the command raises passes to the caller of ExecuteCommand.
  virtual void Execute(const UTF16String& arguments, UTF16OutputStream& out) = 0;

  const UTF16String& GetName() const noexcept { return name_; }
  const UTF16String& GetHelp() const noexcept { return help_; }

  Command(const Command&) = delete;
  Command& operator=(const Command&) = delete;

 private:
  UTF16String name_;
  UTF16String help_;
};

}  // namespace kelcore::console
