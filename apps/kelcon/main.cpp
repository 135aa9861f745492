// kelcon: the developer console of kelcore. It sets the library up as an application
// does, then runs console commands typed at a terminal, read from a pipe or a script
// file, or given once with -c.
#include <kelcore/config/ClientIdentity.h>
#include <kelcore/console/UTF16OutputStream.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/utility/SmallBlockAllocator.h>

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <optional>
#include <string>

#include "CommandLoop.h"
#include "CommandText.h"
#include "HostSession.h"
#include "LineSource.h"

namespace {

constexpr const char* kUsage =
    "Usage: kelcon [OPTIONS] [SCRIPT]\n"
    "\n"
    "The developer console of kelcore. kelcon sets the library up as an application\n"
    "does (error manager and localizer, identity, main thread, XML parser, console\n"
    "commands, log file, trace handlers), then runs console commands:\n"
    "\n"
    "  at a terminal, with line editing, history (kept in the preferences directory)\n"
    "      and Tab completion of command names;\n"
    "  line by line from SCRIPT, or from standard input when it is a pipe or a file;\n"
    "  once, with -c COMMAND.\n"
    "\n"
    "Options:\n"
    "  -c COMMAND     run COMMAND, then exit\n"
    "  -q, --quiet    no banner at an interactive start\n"
    "  --prefs DIR    use DIR as the preferences directory (trace and debug\n"
    "                 databases, logs, history) instead of the default\n"
    "  --no-log       do not open the console log file\n"
    "  -h, --help     show this text\n"
    "\n"
    "Commands: 'help' lists every command with its help text; 'quit' or Ctrl-D leaves.\n"
    "Empty lines and lines starting with # are skipped. Among the commands:\n"
    "  trace.set CATEGORY VOLUME, trace.get CATEGORY, trace.getcategories\n"
    "  debug.set PATH = VALUE, debug.get PATH, debug.list, debug.clear\n"
    "  filesupport.listdirs, filesupport.listvols, filesupport.file PATH,\n"
    "      filesupport.dir PATH\n"
    "  plist.print FILE                load a property list and print it as XML\n"
    "  plist.set FILE KEY TYPE VALUE   set a value in a property list file (made if\n"
    "                                  missing); TYPE is ustring, string, bool, uint16,\n"
    "                                  uint32, int32, int64, uint64, float or double\n"
    "  json.check FILE                 parse a JSON file, report its shape or the error\n"
    "  json.format FILE                print a JSON file in compact form\n"
    "  guid.new                        print a new unique GUID\n"
    "  profile.dump                    print the code profiler's data\n"
    "\n"
    "Exit status: 0 when every command ran, 1 when a command was unknown or failed,\n"
    "2 for a usage error.\n";

struct Arguments {
  std::optional<std::string> command;
  std::optional<std::string> script;
  std::string prefsDir;
  bool quiet = false;
  bool openLog = true;
};

// Parses the command line; prints the usage and exits for -h or a usage error.
Arguments ParseArguments(int argc, char** argv) {
  Arguments args;
  auto usageError = [](const std::string& message) {
    std::fprintf(stderr, "kelcon: %s\nTry 'kelcon --help'.\n", message.c_str());
    std::exit(2);
  };
  for (int i = 1; i < argc; ++i) {
    const std::string arg = argv[i];
    if (arg == "-h" || arg == "--help") {
      std::fputs(kUsage, stdout);
      std::exit(0);
    } else if (arg == "-c" || arg == "--prefs") {
      if (i + 1 == argc) usageError(arg + " needs a value");
      const std::string value = argv[++i];
      if (arg == "-c") {
        args.command = value;
      } else {
        args.prefsDir = value;
      }
    } else if (arg == "-q" || arg == "--quiet") {
      args.quiet = true;
    } else if (arg == "--no-log") {
      args.openLog = false;
    } else if (!arg.empty() && arg[0] == '-' && arg != "-") {
      usageError("unknown option '" + arg + "'");
    } else if (!args.script) {
      args.script = arg;
    } else {
      usageError("more than one script");
    }
  }
  if (args.command && args.script) usageError("-c and a script exclude each other");
  return args;
}

// The history file in the preferences directory, or empty when it cannot be had.
std::string HistoryPath() {
  try {
    return kelcon::ToNarrow(kelcore::filesupport::Dir::PrefDir().FullPath()) +
           "/kelcon history.txt";
  } catch (...) {
    return std::string();
  }
}

int Run(const Arguments& args) {
  kelcon::HostOptions options;
  options.prefsDir = kelcon::ToUTF16(args.prefsDir);
  options.openLogFile = args.openLog;
  kelcon::HostSession session(options);
  auto out = kelcore::console::UTF16OutputStream::Terminal();

  if (args.command) return kelcon::RunCommandLine(*args.command, out, stderr) ? 0 : 1;

  std::unique_ptr<kelcon::LineSource> source;
  std::FILE* script = nullptr;
  if (args.script && *args.script != "-") {
    script = std::fopen(args.script->c_str(), "rb");
    if (script == nullptr) {
      std::fprintf(stderr, "kelcon: cannot open '%s': %s\n", args.script->c_str(),
                   std::strerror(errno));
      return 2;
    }
    source = kelcon::MakeStreamLineSource(script);
  } else if (!args.script && isatty(STDIN_FILENO)) {
    if (!args.quiet) {
      out << "kelcon " << kelcore::config::GetVersionString() << " on "
          << kelcore::config::GetClientPlatform()
          << ". 'help' lists the commands, Tab completes them, Ctrl-D leaves."
          << kelcore::console::endl;
    }
    source = kelcon::MakeTerminalLineSource(HistoryPath());
  } else {
    source = kelcon::MakeStreamLineSource(stdin);
  }
  const bool allRan = kelcon::RunCommandLines(*source, out, stderr);
  source.reset();
  if (script != nullptr) std::fclose(script);
  return allRan ? 0 : 1;
}

}  // namespace

int main(int argc, char** argv) {
  return Run(ParseArguments(argc, argv));
}
