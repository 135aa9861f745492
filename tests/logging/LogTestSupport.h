// A fixture for the console log tests: a fresh preferences directory per test, a fixed
// clock, and the log's process-wide settings returned to their defaults afterwards.
#pragma once

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/logging/ConsoleLogFile.h>

#include <boost/date_time/posix_time/posix_time_types.hpp>

#include <cstdint>
#include <fstream>
#include <sstream>
#include <string>

#include "../filesupport/TempDirFixture.h"

namespace kelcore::console::testing {

inline UTF8String U8(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}

class LogTest : public TempDirTest {
 protected:
  // 2026-11-22 07:57:32.000123 local time; the tick count 4242.
  static boost::posix_time::ptime FixedTime() {
    using namespace boost::posix_time;
    return ptime(boost::gregorian::date(2026, 11, 22),
                 time_duration(7, 57, 32) + microseconds(123));
  }

  void SetUp() override {
    TempDirTest::SetUp();
    config::ResetClientIdentity();
    config::SetClientPrefsDir(RootPath());
    config::SetApplicationName(u"Tester");
    ConsoleLogFile::SetClock({&FixedTime, [] { return std::uint32_t{4242}; }});
    debug::DebugDatabase& switches = debug::DebugDatabase::Instance();
    switches.SetFileWritesDisabled(true);
    switches.Clear();
  }

  void TearDown() override {
    ConsoleLogFile::Terminate();
    ConsoleLogFile::SetClock({});
    ConsoleLogFile::SetDefaultLogFileName(UTF16String());
    ConsoleLogFile::SetDefaultLogFileNameFn({});
    debug::DebugDatabase::Instance().Clear();
    config::ResetClientIdentity();
    TempDirTest::TearDown();
  }

  static void SetSwitch(const char* key, const char* value) {
    debug::DebugDatabase::Instance().SetEntry(U8(key), U8(value));
  }

  // The contents of a file below the temporary directory.
  std::string ReadFile(const std::string& relative) const {
    std::ifstream in(RootBytes() + "/" + relative, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
  }
  std::string ReadLog(const std::string& name) const { return ReadFile("logs/" + name); }

  static constexpr const char* kHeader = "Log file created: 2026-11-22 07:57:32\r\n";
  static constexpr const char* kFooter = "Log file closed: 2026-11-22 07:57:32\r\n";
};

}  // namespace kelcore::console::testing
