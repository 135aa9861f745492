#include "console/TraceCommands.h"

#include <kelcore/debug/Trace.h>
#include <kelcore/logging/ConsoleLogFile.h>
#include <kelcore/utility/UnicodeConversion.h>

#include "console/CommandArguments.h"

#include <list>

namespace kelcore::commands::trace {

using console::endl;
using console::UTF16OutputStream;

namespace {

long VolumeOf(const UTF16String& category) {
  return kelcore::debug::GetTraceVolume(utility::UTF16to8(category).c_str());
}

void ReportVolume(const UTF16String& category, UTF16OutputStream& out) {
  out << "trace volume for category " << category << " is " << VolumeOf(category) << endl;
}

}  // namespace

void Set::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const std::vector<UTF16String> words = SplitWords(arguments);
  if (words.empty()) {
    out << GetHelp() << endl;
    return;
  }
  const UTF16String& category = words[0];
  if (words.size() == 1) {
    ReportVolume(category, out);
    return;
  }
  const std::optional<long> volume = ParseVolume(words[1]);
  if (!volume) {
    out << GetHelp() << endl;
    return;
  }
  kelcore::debug::SetTraceVolume(utility::UTF16to8(category).c_str(), *volume);
  out << "trace category " << category << " set to volume " << *volume << "." << endl;
}

void Get::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const std::vector<UTF16String> words = SplitWords(arguments);
  if (words.empty()) {
    out << GetHelp() << endl;
    return;
  }
  ReportVolume(words[0], out);
}

void GetCategories::Execute(const UTF16String&, UTF16OutputStream& out) {
  std::list<UTF8String> categories;
  kelcore::debug::GetTraceCategories(categories);
  out << "Trace Categories:" << endl;
  for (const UTF8String& category : categories) out << category << endl;
}

void SetMaster::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const std::vector<UTF16String> words = SplitWords(arguments);
  const std::optional<long> volume = words.empty() ? std::nullopt : ParseVolume(words[0]);
  if (!volume) {
    out << GetHelp() << endl;
    return;
  }
  kelcore::debug::SetMasterTraceVolume(*volume);
  out << "Master trace volume set to " << *volume << endl;
}

void GetMaster::Execute(const UTF16String&, UTF16OutputStream& out) {
  out << "Master trace volume is " << kelcore::debug::GetMasterTraceVolume() << endl;
}

void CreateDefaultConsoleLogFile::Execute(const UTF16String&, UTF16OutputStream& out) {
  console::ConsoleLogFile& log = console::ConsoleLogFile::GetInstance();
  UTF8String path;
  if (log.OpenDefaultLogFile(true) && log.GetCurrentLogFilePath(path)) {
    out << "Console log file created: " << path << endl;
  } else {
    out << "The console log file could not be created." << endl;
  }
}

}  // namespace kelcore::commands::trace
