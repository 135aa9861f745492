#include <kelcore/logging/ConsoleLogFile.h>

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/filesupport/PlatformByteStream.h>
#include <kelcore/utility/UnicodeConversion.h>

#include "logging/LogTimeText.h"

#include <boost/date_time/posix_time/posix_time_types.hpp>

#include <algorithm>
#include <chrono>
#include <string>
#include <utility>

namespace kelcore::console {

using filesupport::Dir;
using filesupport::File;

namespace {

// The process-wide settings live on the heap and are never destroyed, so a log written
// during static destruction still finds them.
UTF16String& DefaultNameSlot() {
  static auto* name = new UTF16String();
  return *name;
}

ConsoleLogFile::LogFileNameFn& NameFnSlot() {
  static auto* fn = new ConsoleLogFile::LogFileNameFn();
  return *fn;
}

boost::posix_time::ptime SystemLocalTime() {
  return boost::posix_time::microsec_clock::local_time();
}

std::uint32_t SystemTickCount() {
  const auto sinceStart = std::chrono::steady_clock::now().time_since_epoch();
  return static_cast<std::uint32_t>(
      std::chrono::duration_cast<std::chrono::milliseconds>(sinceStart).count());
}

ConsoleLogFile::Clock& ClockSlot() {
  static ConsoleLogFile::Clock clock{&SystemLocalTime, &SystemTickCount};
  return clock;
}

std::mutex& InstanceMutex() {
  static auto* mutex = new std::mutex();
  return *mutex;
}

ConsoleLogFile*& InstanceSlot() {
  static ConsoleLogFile* instance = nullptr;
  return instance;
}

UTF8String Narrow(std::string_view text) {
  return UTF8String(reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

UTF8String StampedLine(std::string_view label) {
  UTF8String line = Narrow(label);
  line += Narrow(logging::FormatLogDateTime(ClockSlot().localTime()));
  line += Narrow("\r\n");
  return line;
}

bool DebugSwitchIsTrue(const char* key) {
  const UTF8String value = debug::DebugDatabase::Instance().GetEntry(Narrow(key));
  return value == Narrow("true");
}

// What the debug database says about opening the default log.
struct OpenSwitches {
  bool createIfMissing = false;
  bool timestampedNames = false;
};

OpenSwitches ReadOpenSwitches() {
  OpenSwitches switches;
  try {
    switches.createIfMissing = DebugSwitchIsTrue("CreateLogFilesThatDoNotExist");
    switches.timestampedNames = DebugSwitchIsTrue("AddTimestampToLogFileNames");
  } catch (...) {
    // An unreadable debug database means its defaults: no switch is on.
  }
  return switches;
}

// The "logs" folder in the preferences directory, created when missing; throws the file
// exceptions when it cannot be had.
Dir LogsDir() {
  Dir logs(Dir::PrefDir(), u"logs");
  utility::FileUtils::EnsureDirectoryExists(logs);
  return logs;
}

}  // namespace

ConsoleLogFile::ConsoleLogFile() = default;

ConsoleLogFile::~ConsoleLogFile() {
  std::lock_guard lock(mutex_);
  CloseLocked(true);
}

ConsoleLogFile& ConsoleLogFile::GetInstance() {
  std::lock_guard lock(InstanceMutex());
  ConsoleLogFile*& instance = InstanceSlot();
  if (instance == nullptr) instance = new ConsoleLogFile();
  return *instance;
}

void ConsoleLogFile::Terminate() {
  std::lock_guard lock(InstanceMutex());
  delete std::exchange(InstanceSlot(), nullptr);
}

bool ConsoleLogFile::OpenLogFile(const UTF8String& path) {
  std::lock_guard lock(mutex_);
  CloseLocked(true);
  logOpened_ = true;
  const File file(std::string(path.begin(), path.end()));
  return OpenLocked(file, true);
}

bool ConsoleLogFile::OpenDefaultLogFile(bool createIfMissing) {
  OpenSwitches switches = ReadOpenSwitches();
  switches.createIfMissing = switches.createIfMissing || createIfMissing;
  std::lock_guard lock(mutex_);
  CloseLocked(true);
  logOpened_ = true;
  return OpenDefaultLocked(switches.createIfMissing, switches.timestampedNames);
}

void ConsoleLogFile::CloseLogFile() {
  std::lock_guard lock(mutex_);
  CloseLocked(true);
}

bool ConsoleLogFile::Exists() const {
  std::lock_guard lock(mutex_);
  return stream_ != nullptr;
}

bool ConsoleLogFile::GetCurrentLogFilePath(UTF8String& path) const {
  std::lock_guard lock(mutex_);
  if (stream_ == nullptr) return false;
  path = Narrow(logFile_.FullPathMultiByte());
  return true;
}

bool ConsoleLogFile::GetLogFilePath(UTF8String& path, bool last) const {
  try {
    const File file(LogsDir(), GetDefaultLogFileName(last));
    path = Narrow(file.FullPathMultiByte());
    return true;
  } catch (const std::exception&) {
    return false;
  }
}

void ConsoleLogFile::WriteToLog(const UTF8String& text, bool addTicks) {
  std::unique_lock lock(mutex_);
  if (stream_ == nullptr && !logOpened_ && config::IsClientNameInitialized()) {
    logOpened_ = true;
    // The debug database has a lock of its own and may trace; it is never asked while
    // this log's mutex is held.
    lock.unlock();
    const OpenSwitches switches = ReadOpenSwitches();
    lock.lock();
    if (stream_ == nullptr) OpenDefaultLocked(switches.createIfMissing, switches.timestampedNames);
  }
  if (stream_ == nullptr) return;

  UTF8String line;
  if ((addTicks || addTimeInTicks_) && !suppressTicks_) {
    line = Narrow("Ticks = ");
    line += Narrow(std::to_string(ClockSlot().tickCount()));
    line += Narrow(useTabDelimiter_ ? "\t" : "      ");
  }
  line += text;
  AppendLocked(line);
}

void ConsoleLogFile::AddTimeInTicks(bool add) {
  std::lock_guard lock(mutex_);
  addTimeInTicks_ = add;
  suppressTicks_ = !add;
}

void ConsoleLogFile::UseTabDelimiter(bool useTab) {
  std::lock_guard lock(mutex_);
  useTabDelimiter_ = useTab;
}

UTF16String ConsoleLogFile::GetDefaultLogFileName(bool last) {
  const UTF16String& setName = DefaultNameSlot();
  const UTF16String base = setName.empty() ? config::GetApplicationName() : setName;
  const LogFileNameFn& fn = NameFnSlot();
  if (fn) return fn(base);
  return base + (last ? u" Log-last.txt" : u" Log.txt");
}

UTF16String ConsoleLogFile::GetTimestampedLogFileName(const UTF16String& name) {
  const std::string stamp = logging::FormatLogFileTimestamp(ClockSlot().localTime());
  return name + u" " + utility::UTF8to16(Narrow(stamp)) + u".txt";
}

void ConsoleLogFile::SetDefaultLogFileName(const UTF16String& name) {
  DefaultNameSlot() = name;
}

void ConsoleLogFile::SetDefaultLogFileNameFn(const LogFileNameFn& fn) {
  NameFnSlot() = fn;
}

void ConsoleLogFile::SetClock(const Clock& clock) {
  Clock& slot = ClockSlot();
  slot.localTime = clock.localTime != nullptr ? clock.localTime : &SystemLocalTime;
  slot.tickCount = clock.tickCount != nullptr ? clock.tickCount : &SystemTickCount;
}

bool ConsoleLogFile::OpenLocked(File file, bool truncate) {
  try {
    if (truncate) file.Create(false);
    logFile_ = file;
    atLineStart_ = true;
    stream_ = std::make_unique<filesupport::OPlatformByteStream>(
        file, filesupport::kPlatformStreamSharing);
    if (AppendLocked(StampedLine("Log file created: "))) return true;
  } catch (...) {
    // Opening never reaches the writer: a log that cannot be made is simply absent.
  }
  CloseLocked(false);
  return false;
}

bool ConsoleLogFile::OpenDefaultLocked(bool createIfMissing, bool timestampedNames) {
  try {
    const Dir logs = LogsDir();
    File current(logs, GetDefaultLogFileName(false));
    if (!current.Exists() && !createIfMissing) return false;
    if (!timestampedNames) {
      // Keep the previous run's log under the "last" name. With a naming function both
      // names may be one; the log is then simply started afresh.
      const UTF16String lastName = GetDefaultLogFileName(true);
      File last(logs, lastName);
      if (!(last == current)) {
        if (last.Exists()) last.Delete();
        if (current.Exists()) {
          File moving = current;
          moving.Rename(lastName);
        }
        if (current.Exists()) current.Delete();
      }
    }
    return OpenLocked(current, true);
  } catch (...) {
    CloseLocked(false);
    return false;
  }
}

void ConsoleLogFile::CloseLocked(bool writeFooter) {
  if (stream_ == nullptr) return;
  if (writeFooter) {
    // The footer gets a line of its own even after text that did not end its line.
    UTF8String footer = atLineStart_ ? UTF8String() : Narrow("\r\n");
    AppendLocked(footer + StampedLine("Log file closed: "));
  }
  stream_.reset();
  logFile_ = File();
}

bool ConsoleLogFile::AppendLocked(const UTF8String& bytes) {
  if (stream_ == nullptr) return false;
  try {
    std::size_t done = 0;
    while (done < bytes.size()) {
      // WriteBlock takes an unsigned long count, which is 32-bit on Windows.
      const std::size_t piece = std::min<std::size_t>(bytes.size() - done, 1u << 30);
      stream_->WriteBlock(bytes.data() + done, static_cast<unsigned long>(piece));
      done += piece;
    }
    if (!bytes.empty()) atLineStart_ = bytes.back() == '\n';
    return true;
  } catch (...) {
    stream_.reset();
    logFile_ = File();
    return false;
  }
}

}  // namespace kelcore::console
