// The process-wide text log into which console and trace output is copied.
//
// One instance per process (GetInstance). The log lives in the folder "logs" inside the
// preferences directory (Dir::PrefDir), created when missing. Its name is the
// application name (or the name set with SetDefaultLogFileName) followed by " Log.txt";
// the previous run's log is kept beside it as "<name> Log-last.txt". A host may replace
// the naming with SetDefaultLogFileNameFn, for instance with GetTimestampedLogFileName
// so that every run writes a file of its own.
//
// Opening the default log happens once, on the first WriteToLog after the client name is
// set (config::IsClientNameInitialized), and whenever OpenDefaultLogFile is called:
//   1. Without a file at the default path, a log is made only when the debug database
//      says "true" for "CreateLogFilesThatDoNotExist" (OpenDefaultLogFile can force it).
//   2. When the debug database says "true" for "AddTimestampToLogFileNames", the file is
//      created afresh under its name and nothing is rotated.
//   3. Otherwise the previous log is rotated: the " Log-last.txt" file is deleted, the
//      current log is renamed to it, anything left at the default path is deleted and
//      the file is created empty.
//   4. The header line is written: "Log file created: " + local date and time.
// Closing writes "Log file closed: " + local date and time, on a line of its own (after a
// "\r\n" when the last write did not end its line). Both lines end with "\r\n";
// the date and time read "YYYY-MM-DD HH:MM:SS" (for example "2026-11-22 07:57:32").
//
// A failure while opening (no preferences directory, no permission, a full disk, ...)
// leaves no log open and raises nothing. Writes do not try again (a log that could not
// be made costs them nothing); OpenLogFile and OpenDefaultLogFile may be called at any
// time. A failing write closes the log without a footer, silently: writers are tracing
// code that must never see an error from the log.
//
// Each write is appended as it is given (the caller supplies the line ends) and reaches
// the file at once, unbuffered, so the log survives a crash of the process. With
// `addTicks` a line is prefixed with "Ticks = " + the millisecond tick count (a 32-bit
// count since the system started, wrapping like the system's tick counter) + a separator:
// a TAB when UseTabDelimiter(true) was called, else six spaces.
//
// Threads: any thread may call the members. Each takes the instance's mutex, and a write
// holds it while it opens the log, adds the prefix and appends, so lines written from
// several threads never interleave. (The debug database, which has a lock of its own, is
// read before that mutex is taken.) The process-wide settings (SetDefaultLogFileName,
// SetDefaultLogFileNameFn, SetClock) are unsynchronised: set them at start-up. Terminate
// must not race with other members: call it at shut-down, after tracing has stopped. A
// process that never calls it leaves its log without the footer.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/utility/StringTypes.h>

#include <boost/date_time/posix_time/ptime.hpp>
#include <boost/function.hpp>

#include <cstdint>
#include <memory>
#include <mutex>

namespace kelcore::filesupport {
class OPlatformByteStream;
}

namespace kelcore::console {

class KELCORE_API ConsoleLogFile {
 public:
  // Maps the base name (the application name or the set default name) to a file name.
  using LogFileNameFn = boost::function<UTF16String(const UTF16String&)>;

  // Where the log takes its times from. Hosts leave the default (the system's local time
  // and monotonic clock); tests fix them.
  struct Clock {
    boost::posix_time::ptime (*localTime)() = nullptr;  // header, footer, file names
    std::uint32_t (*tickCount)() = nullptr;             // milliseconds, for "Ticks = "
  };

  // The instance, made on first use (also after Terminate).
  static ConsoleLogFile& GetInstance();
  // Closes an open log (writing the footer) and destroys the instance.
  static void Terminate();

  // Closes a log that is open (with its footer), then creates the file at `path` (UTF-8;
  // an existing file is replaced), opens it and writes the header. Returns false, with no
  // log open, when the file cannot be created or written.
  bool OpenLogFile(const UTF8String& path);
  // Opens the default log as described above, closing a log that is open first. With
  // `createIfMissing` the log is made even when no file exists at the default path and
  // the debug database does not ask for it. Returns whether a log is open afterwards.
  bool OpenDefaultLogFile(bool createIfMissing);
  // Writes the footer and closes the log; nothing happens when none is open.
  void CloseLogFile();
  // Whether a log file is open.
  bool Exists() const;
  // The path (UTF-8) of the open log; false, with `path` unchanged, when none is open.
  bool GetCurrentLogFilePath(UTF8String& path) const;
  // The path (UTF-8) of the default log (`last` false) or of the previous run's log
  // (`last` true), creating the "logs" folder when it is missing. False, with `path`
  // unchanged, when the folder cannot be had or created.
  bool GetLogFilePath(UTF8String& path, bool last) const;

  // Appends `text` to the log, opening the default log first when none has been opened
  // or tried yet and the client name is set. Does nothing when no log is open.
  void WriteToLog(const UTF8String& text, bool addTicks);

  // true: every write carries the ticks prefix, whatever its `addTicks`; false: no write
  // carries it. Until the first call each write's `addTicks` decides.
  void AddTimeInTicks(bool add);
  // Separates the ticks prefix from the text with a TAB instead of six spaces.
  void UseTabDelimiter(bool useTab);

  // The log's file name: the naming function applied to the base name when one is set
  // (`last` is then not used), else the base name + " Log.txt" or, when `last` is true,
  // + " Log-last.txt". The base name is the one set with SetDefaultLogFileName when not
  // empty, else config::GetApplicationName().
  static UTF16String GetDefaultLogFileName(bool last);
  // `name` + " " + the current local time as "%Y%m%d-%H%M%S_%f" (microseconds, six
  // digits) + ".txt", e.g. "App 20261122-075732_000123.txt".
  static UTF16String GetTimestampedLogFileName(const UTF16String& name);
  // The base name; empty (the default) returns to the application name.
  static void SetDefaultLogFileName(const UTF16String& name);
  // The naming function; an empty function (the default) returns to " Log.txt" names.
  static void SetDefaultLogFileNameFn(const LogFileNameFn& fn);
  // Replaces the clock; a null member restores that member's default.
  static void SetClock(const Clock& clock);

  ConsoleLogFile(const ConsoleLogFile&) = delete;
  ConsoleLogFile& operator=(const ConsoleLogFile&) = delete;
  ~ConsoleLogFile();

 private:
  ConsoleLogFile();

  bool OpenLocked(filesupport::File file, bool truncate);
  bool OpenDefaultLocked(bool createIfMissing, bool timestampedNames);
  void CloseLocked(bool writeFooter);
  bool AppendLocked(const UTF8String& bytes);

  // Recursive, so that a trace made while the log is being opened finds it busy instead
  // of deadlocking.
  mutable std::recursive_mutex mutex_;
  filesupport::File logFile_;
  std::unique_ptr<filesupport::OPlatformByteStream> stream_;
  bool logOpened_ = false;  // a log was opened, or the automatic open was tried
  bool addTimeInTicks_ = false;
  bool suppressTicks_ = false;
  bool useTabDelimiter_ = false;
  bool atLineStart_ = true;  // the last byte written ended a line
};

}  // namespace kelcore::console
