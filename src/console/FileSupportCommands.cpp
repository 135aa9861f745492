#include "console/FileSupportCommands.h"

#include <kelcore/filesupport/CommonDirs.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/FileExceptions.h>

#include "console/CommandArguments.h"

#include <boost/date_time/posix_time/time_formatters.hpp>

#include <functional>

namespace kelcore::commands::filesupport {

using console::endl;
using console::UTF16OutputStream;
using kelcore::filesupport::Dir;
using kelcore::filesupport::File;
namespace commondirs = kelcore::filesupport::commondirs;

namespace {

const UTF16String kHouse = u"house";

// Writes `label` and the text `step` returns on one line; a file or directory exception
// becomes "Threw ...". Returns whether the step succeeded.
bool Report(UTF16OutputStream& out, const char* label, const std::function<UTF16String()>& step) {
  UTF16String result;
  bool succeeded = false;
  try {
    result = step();
    succeeded = true;
  } catch (const kelcore::filesupport::file_exception&) {
    result = u"Threw file_exception";
  } catch (const kelcore::filesupport::dir_exception&) {
    result = u"Threw dir_exception";
  }
  out << label << result << endl;
  return succeeded;
}

UTF16String TimeText(const boost::posix_time::ptime& time) {
  const std::string text = boost::posix_time::to_simple_string(time);
  return UTF16String(text.begin(), text.end());
}

}  // namespace

void ListDirs::Execute(const UTF16String&, UTF16OutputStream& out) {
  const auto dir = [](Dir (*get)()) { return [get] { return get().FullPath(); }; };
  out << "commondirs Functions:" << endl;
  Report(out, "Main Executable File = \t",
         [] { return commondirs::MainExecutableFile().FullPath(); });
  Report(out, "Executable Dir = \t\t", dir(&commondirs::ExecutableDir));
  Report(out, "Resources Dir = \t\t", dir(&commondirs::ResourcesDir));
  Report(out, "Plugins Dir = \t\t", dir(&commondirs::PluginsDir));
  Report(out, "Required Plugins Dir = \t", dir(&commondirs::RequiredPluginsDir));
  Report(out, "User Plugins Dir = \t\t", dir(&commondirs::UserPluginsDir));
  Report(out, "All User Plugins Dir = \t", dir(&commondirs::AllUserPluginsDir));
  Report(out, "User Documents Dir = \t", dir(&commondirs::UserDocumentsDir));
  Report(out, "All Users Documents Dir = \t", dir(&commondirs::AllUsersDocumentsDir));
  Report(out, "User Desktop Dir = \t\t", dir(&commondirs::UserDesktopDir));
  Report(out, "Current User Dir = \t\t", dir(&commondirs::CurrentUserDir));
  out << "Dir Methods:" << endl;
  Report(out, "App Dir = \t\t", dir(&Dir::AppDir));
  Report(out, "User Docs Dir = \t\t", dir(&Dir::UserDocsDir));
  Report(out, "Temp Dir = \t\t", dir(&Dir::TempDir));
  Report(out, "Pref Dir = \t\t", dir(&Dir::PrefDir));
  Report(out, "Global Pref Dir = \t\t", dir(&Dir::GlobalPrefDir));
  Report(out, "Package Dir = \t\t", dir(&Dir::PackageDir));
  Report(out, "Common Files Dir = \t\t", dir(&Dir::CommonFilesDir));
}

void ListVols::Execute(const UTF16String&, UTF16OutputStream& out) {
  out << "List Volumes:" << endl;
  for (auto volume = Dir::BeginVolumes(); volume != Dir::EndVolumes(); ++volume) {
    out << volume->FullPath() << endl;
  }
}

void FileExists::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const UTF16String path = TrimSpaces(arguments);
  if (path.empty()) {
    out << GetHelp() << endl;
    return;
  }
  File file(path);
  out << "File Path: " << file.FullPath() << endl;
  const bool found = file.Exists();
  out << (found ? " File found." : " File not found.") << endl;
  const bool created = !found && Report(out, " Create: ", [&] {
    file.Create(true);
    return UTF16String(u"created the file.");
  });
  Report(out, " Created: ", [&] { return TimeText(file.Created()); });
  Report(out, " Modified: ", [&] { return TimeText(file.Modified()); });
  Report(out, " Name: ", [&] { return file.GetName(); });
  Report(out, " Title: ", [&] { return file.GetTitle(); });
  Report(out, " Extension: ", [&] { return file.GetExtension(); });
  Report(out, " Copy: ", [&] {
    const File copy = file;
    return UTF16String(copy == file ? u"compares equal." : u"compares different.");
  });
  const UTF16String name = file.GetName();
  const bool renamed = Report(out, " Rename: ", [&] {
    file.Rename(kHouse);
    return file.FullPath();
  });
  if (renamed) {
    Report(out, " Rename back: ", [&] {
      file.Rename(name);
      return file.FullPath();
    });
  }
  if (created) {
    Report(out, " Delete: ", [&] {
      file.Delete();
      return UTF16String(u"deleted the file.");
    });
  }
}

void DirExists::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const UTF16String path = TrimSpaces(arguments);
  if (path.empty()) {
    out << GetHelp() << endl;
    return;
  }
  Dir dir(path);
  out << "Directory Path: " << dir.FullPath() << endl;
  out << " Dir Name: " << dir.GetName() << endl;
  out << " Parent Path: " << dir.Parent().FullPath() << endl;
  const bool found = dir.Exists();
  out << (found ? " Directory found." : " Directory not found.") << endl;
  const bool created = !found && Report(out, " Create: ", [&] {
    dir.Create();
    return UTF16String(u"created the directory.");
  });
  Report(out, " Created: ", [&] { return TimeText(dir.Created()); });
  Report(out, " Modified: ", [&] { return TimeText(dir.Modified()); });
  out << " Top Level: " << (dir.IsTopLevelDir() ? "yes" : "no") << endl;
  Report(out, " Copy: ", [&] {
    const Dir copy = dir;
    return UTF16String(copy == dir ? u"compares equal." : u"compares different.");
  });
  const UTF16String name = dir.GetName();
  const bool renamed = Report(out, " Rename: ", [&] {
    dir.Rename(kHouse);
    return dir.FullPath();
  });
  if (renamed) {
    Report(out, " Rename back: ", [&] {
      dir.Rename(name);
      return dir.FullPath();
    });
  }
  if (created) {
    Report(out, " Delete: ", [&] {
      dir.Delete();
      return UTF16String(u"deleted the directory.");
    });
  }
}

}  // namespace kelcore::commands::filesupport
