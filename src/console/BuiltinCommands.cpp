// Initialize and Terminate: the library's built-in commands and their help texts.
#include <kelcore/console/CommandRegistry.h>
#include <kelcore/console/ConsoleCommands.h>

#include "console/DebugCommands.h"
#include "console/FileSupportCommands.h"
#include "console/TraceCommands.h"

namespace kelcore::console {

namespace {

template <class CommandClass>
Command* Make(const UTF16String& name, const UTF16String& help) {
  return new CommandClass(name, help);
}

struct Builtin {
  const char16_t* name;
  const char16_t* help;
  CommandFactory factory;
};

// In the order Initialize registers them.
const Builtin kBuiltins[] = {
    {u"debug.get",
     u"debug.get <variable path> - Gets the value of the debug variable from the debug "
     u"database.",
     &Make<commands::debug::Get>},
    {u"debug.list", u"debug.list - displays the entire contents of the debug database.",
     &Make<commands::debug::List>},
    {u"debug.set",
     u"debug.set <variable path> = <value> - Sets the value of the debug variable in the "
     u"debug database.",
     &Make<commands::debug::Set>},
    {u"debug.clear", u"debug.clear - clears the contents of the debug database.",
     &Make<commands::debug::Clear>},
    {u"trace.set", u"trace.set <category> <volume> - Sets the volume of this trace category.",
     &Make<commands::trace::Set>},
    {u"trace.get", u"trace.get <category> - Gets the volume of this trace category.",
     &Make<commands::trace::Get>},
    {u"trace.getcategories", u"trace.getcategories - Lists all catagories that have been traced.",
     &Make<commands::trace::GetCategories>},
    {u"trace.set.master",
     u"trace.set.master <volume> - Sets the master trace volume. This is the highest volume "
     u"that will be traced.",
     &Make<commands::trace::SetMaster>},
    {u"trace.get.master",
     u"trace.get.master - Gets the master trace volume. This is the highest volume that will "
     u"be traced.",
     &Make<commands::trace::GetMaster>},
    {u"trace.createdefaultconsolelogfile",
     u"trace.createdefaultconsolelogfile - Creates a default log file for trace statements.",
     &Make<commands::trace::CreateDefaultConsoleLogFile>},
    {u"filesupport.listdirs", u"filesupport.listdirs - list the special directoriees.",
     &Make<commands::filesupport::ListDirs>},
    {u"filesupport.listvols", u"filesupport.listvols - list the mounted volumes.",
     &Make<commands::filesupport::ListVols>},
    {u"filesupport.file",
     u"filesupport.file <file path> - given a file name, echos the path and indicates if the "
     u"file exists",
     &Make<commands::filesupport::FileExists>},
    {u"filesupport.dir",
     u"filesupport.dir <file path> - given a path, echos the path and indicates if the "
     u"directory exists",
     &Make<commands::filesupport::DirExists>},
};

}  // namespace

void Initialize() {
  for (const Builtin& builtin : kBuiltins) {
    CommandRegistry::RegisterCommand(builtin.name, builtin.help, builtin.factory);
  }
}

void Terminate() {
  for (const Builtin& builtin : kBuiltins) CommandRegistry::UnregisterCommand(builtin.name);
}

}  // namespace kelcore::console
