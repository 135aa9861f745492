// A fixture for the console tests: the built-in commands registered, a fresh preferences
// directory (so a fresh trace database) per test, and a stream over a UTF16String.
#pragma once

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/console/ConsoleCommands.h>
#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/debug/Trace.h>
#include <kelcore/logging/ConsoleLogFile.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <string>

#include "../filesupport/TempDirFixture.h"

namespace kelcore::console::testing {

inline UTF16String U16(const std::string& utf8) {
  return utility::UTF8to16(UTF8String(utf8.begin(), utf8.end()));
}

class ConsoleTest : public TempDirTest {
 protected:
  void SetUp() override {
    TempDirTest::SetUp();
    config::ResetClientIdentity();
    config::SetClientPrefsDir(RootPath());
    config::SetApplicationName(u"Tester");
    debug::ShutdownTraceManager();
    debug::DebugDatabase::Instance().SetFileWritesDisabled(true);
    debug::DebugDatabase::Instance().Clear();
    Initialize();
  }

  void TearDown() override {
    Terminate();
    ConsoleLogFile::Terminate();
    debug::ShutdownTraceManager();
    debug::DebugDatabase::Instance().Clear();
    config::ResetClientIdentity();
    TempDirTest::TearDown();
  }

  // Runs `line` and returns what it wrote; fails the test when no command ran.
  UTF16String Run(const std::string& line) {
    UTF16String text;
    UTF16OutputStream out(text);
    EXPECT_TRUE(ExecuteCommand(U16(line), out)) << line;
    return text;
  }
};

}  // namespace kelcore::console::testing
