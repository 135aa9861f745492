// The registry, command lines and the command list.
#include <kelcore/console/CommandRegistry.h>

#include "ConsoleTestSupport.h"

namespace kelcore::console::testing {
namespace {

int gMade = 0;

// Echoes its argument text between brackets.
class Echo final : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, UTF16OutputStream& out) override {
    out << GetName() << "[" << arguments << "]";
  }
};

Command* MakeEcho(const UTF16String& name, const UTF16String& help) {
  ++gMade;
  return new Echo(name, help);
}

Command* MakeNothing(const UTF16String&, const UTF16String&) {
  return nullptr;
}

using RegistryTest = ConsoleTest;

TEST_F(RegistryTest, CommandLinesAreSplitIntoNameAndArgumentText) {
  CommandRegistry::RegisterCommand(u"echo", u"echo - echoes", &MakeEcho);
  const std::vector<std::pair<std::string, std::string>> cases = {
      {"echo", "echo[]"},        {"echo a b", "echo[a b]"}, {"   echo    a  b  ", "echo[a  b  ]"},
      {"echo a\r\n", "echo[a]"}, {"echo\n", "echo[]"},
  };
  for (const auto& [line, expected] : cases) EXPECT_EQ(Run(line), U16(expected)) << line;
  CommandRegistry::UnregisterCommand(u"echo");
}

TEST_F(RegistryTest, LinesWithoutAKnownNameRunNothingAndWriteNothing) {
  CommandRegistry::RegisterCommand(u"echo", u"echo - echoes", &MakeEcho);
  for (const char* line : {"", "    ", "\r\n", "Echo x", "ech", "echo.x", "unknown echo"}) {
    UTF16String text;
    UTF16OutputStream out(text);
    EXPECT_FALSE(ExecuteCommand(U16(line), out)) << line;
    EXPECT_TRUE(text.empty()) << line;
  }
  CommandRegistry::UnregisterCommand(u"echo");
}

TEST_F(RegistryTest, CommandIsMadeOnceAndHandedBackOnUnregister) {
  gMade = 0;
  EXPECT_EQ(CommandRegistry::UnregisterCommand(u"echo"), nullptr);
  CommandRegistry::RegisterCommand(u"echo", u"echo - echoes", &MakeEcho);
  EXPECT_EQ(CommandRegistry::UnregisterCommand(u"echo"), nullptr);  // never ran

  CommandRegistry::RegisterCommand(u"echo", u"echo - echoes", &MakeEcho);
  Run("echo 1");
  Run("echo 2");
  EXPECT_EQ(gMade, 1);
  const std::unique_ptr<Command> command = CommandRegistry::UnregisterCommand(u"echo");
  ASSERT_NE(command, nullptr);
  EXPECT_EQ(command->GetName(), u"echo");
  EXPECT_EQ(command->GetHelp(), u"echo - echoes");
  EXPECT_EQ(CommandRegistry::FindCommand(u"echo"), nullptr);
}

TEST_F(RegistryTest, BadRegistrationsAreRefused) {
  EXPECT_THROW(CommandRegistry::RegisterCommand(u"", u"h", &MakeEcho), std::invalid_argument);
  EXPECT_THROW(CommandRegistry::RegisterCommand(u"two words", u"h", &MakeEcho),
               std::invalid_argument);
  EXPECT_THROW(CommandRegistry::RegisterCommand(u"x", u"h", nullptr), std::invalid_argument);
  EXPECT_EQ(CommandRegistry::FindCommand(u"x"), nullptr);

  CommandRegistry::RegisterCommand(u"broken", u"h", &MakeNothing);
  UTF16String text;
  UTF16OutputStream out(text);
  EXPECT_THROW(ExecuteCommand(u"broken", out), std::runtime_error);
  CommandRegistry::UnregisterCommand(u"broken");
}

TEST_F(RegistryTest, ListCommandsLayoutWithTheBuiltinsInNameOrder) {
  CommandRegistry::RegisterCommand(u"zz.host", u"zz.host - the host's own", &MakeEcho);
  UTF16String text;
  UTF16OutputStream out(text);
  ListCommands(out);
  CommandRegistry::UnregisterCommand(u"zz.host");
  EXPECT_EQ(text,
            u"Currently installed commands.\n"
            u"-----------------------------\n"
            u"debug.clear - clears the contents of the debug database.\n"
            u"debug.get <variable path> - Gets the value of the debug variable from the debug "
            u"database.\n"
            u"debug.list - displays the entire contents of the debug database.\n"
            u"debug.set <variable path> = <value> - Sets the value of the debug variable in the "
            u"debug database.\n"
            u"filesupport.dir <file path> - given a path, echos the path and indicates if the "
            u"directory exists\n"
            u"filesupport.file <file path> - given a file name, echos the path and indicates if "
            u"the file exists\n"
            u"filesupport.listdirs - list the special directoriees.\n"
            u"filesupport.listvols - list the mounted volumes.\n"
            u"trace.createdefaultconsolelogfile - Creates a default log file for trace "
            u"statements.\n"
            u"trace.get <category> - Gets the volume of this trace category.\n"
            u"trace.get.master - Gets the master trace volume. This is the highest volume that "
            u"will be traced.\n"
            u"trace.getcategories - Lists all catagories that have been traced.\n"
            u"trace.set <category> <volume> - Sets the volume of this trace category.\n"
            u"trace.set.master <volume> - Sets the master trace volume. This is the highest "
            u"volume that will be traced.\n"
            u"zz.host - the host's own\n"
            u"\n");
}

TEST_F(RegistryTest, TerminateRemovesExactlyTheBuiltins) {
  CommandRegistry::RegisterCommand(u"host.cmd", u"host.cmd - kept", &MakeEcho);
  Terminate();
  int left = 0;
  CommandRegistry::ForEachCommand([&left](const CommandRegistry::Record&) { ++left; });
  EXPECT_EQ(left, 1);
  EXPECT_NE(CommandRegistry::FindCommand(u"host.cmd"), nullptr);
  CommandRegistry::UnregisterCommand(u"host.cmd");
  Initialize();
  CommandRegistry::ForEachCommand([&left](const CommandRegistry::Record&) { ++left; });
  EXPECT_EQ(left, 1 + 14);
}

TEST(StandardConsole, CreatingItTwiceIsHarmless) {
  EXPECT_TRUE(CreateStandardConsoleWindow());
  EXPECT_TRUE(CreateStandardConsoleWindow());
}

}  // namespace
}  // namespace kelcore::console::testing
