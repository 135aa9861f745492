#include "CommandLoop.h"

#include <kelcore/config/LocalizedError.h>
#include <kelcore/console/ConsoleCommands.h>
#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/utility/ZString.h>

#include <exception>

#include "CommandText.h"
#include "HostCommands.h"

namespace kelcon {

namespace {

using kelcore::UTF16String;
namespace fs = kelcore::filesupport;

// The user-facing text of the exception being handled.
std::string DescribeCurrentException() {
  try {
    throw;
  } catch (const kelcore::config::LocalizedError& error) {
    return ToNarrow(error.GetLocalizedMessage());
  } catch (const fs::rename_file& error) {
    return ToNarrow(kelcore::ZString(error.what(), error.GetFile().FullPath(), error.GetNewName()));
  } catch (const fs::file_exception& error) {
    return ToNarrow(kelcore::ZString(error.what(), error.GetFile().FullPath()));
  } catch (const fs::rename_dir& error) {
    return ToNarrow(kelcore::ZString(error.what(), error.GetDir().FullPath(), error.GetNewName()));
  } catch (const fs::dir_exception& error) {
    return ToNarrow(kelcore::ZString(error.what(), error.GetDir().FullPath()));
  } catch (const std::exception& error) {
    return error.what();
  } catch (...) {
    return "an unknown exception";
  }
}

}  // namespace

bool RunCommandLine(const std::string& line, kelcore::console::UTF16OutputStream& out,
                    std::FILE* errors) {
  const std::string command = TrimSpaces(line);
  if (command.empty() || command.front() == '#') return true;
  try {
    if (kelcore::console::ExecuteCommand(ToUTF16(command), out)) return true;
    const std::string name = command.substr(0, command.find(' '));
    std::fprintf(errors, "kelcon: unknown command '%s'; 'help' lists the commands.\n",
                 name.c_str());
  } catch (...) {
    out.Flush();
    std::fprintf(errors, "kelcon: %s\n", DescribeCurrentException().c_str());
  }
  std::fflush(errors);
  return false;
}

bool RunCommandLines(LineSource& source, kelcore::console::UTF16OutputStream& out,
                     std::FILE* errors) {
  bool allRan = true;
  std::string line;
  while (!QuitRequested() && source.Next(line)) {
    allRan = RunCommandLine(line, out, errors) && allRan;
  }
  return allRan;
}

}  // namespace kelcon
