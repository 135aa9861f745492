// Shared by the debug tests: a unique temporary preferences directory per test, and a
// trace handler that records what it receives.
#pragma once

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/debug/Trace.h>
#include <kelcore/debug/TraceHandler.h>
#include <kelcore/utility/StringTypes.h>

#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <mutex>
#include <random>
#include <sstream>
#include <string>
#include <vector>

namespace kelcore::debug::testing {

inline UTF8String U8(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}
inline std::string Narrow(const UTF8String& text) {
  return std::string(text.begin(), text.end());
}
inline const unsigned char* C(const char* text) {
  return reinterpret_cast<const unsigned char*>(text);
}

// A fresh directory under the system's temporary folder, made the host's preferences
// directory for the test's lifetime, so that no test touches the real home.
class TempPrefsDir {
 public:
  TempPrefsDir() {
    std::random_device random;
    for (;;) {
      path_ = std::filesystem::temp_directory_path() /
              ("kelcore-debug-" + std::to_string(random()) + std::to_string(random()));
      if (std::filesystem::create_directory(path_)) break;
    }
    const std::string text = path_.string();
    config::SetClientPrefsDir(UTF16String(text.begin(), text.end()));
  }
  // The preferences directory keeps naming the removed directory, so that nothing done
  // after the test (the debug database's last save at exit, say) reaches the real home.
  ~TempPrefsDir() {
    std::error_code ignored;
    std::filesystem::remove_all(path_, ignored);
  }
  TempPrefsDir(const TempPrefsDir&) = delete;
  TempPrefsDir& operator=(const TempPrefsDir&) = delete;

  const std::filesystem::path& Path() const { return path_; }
  bool HasFile(const char* name) const { return std::filesystem::exists(path_ / name); }
  std::string ReadFile(const char* name) const {
    std::ifstream in(path_ / name, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
  }
  void WriteFile(const char* name, const std::string& text) const {
    std::ofstream(path_ / name, std::ios::binary) << text;
  }

 private:
  std::filesystem::path path_;
};

// Every test of the process-wide trace state starts from an unloaded database in a
// fresh preferences directory and the default handler.
class TraceStateTest : public ::testing::Test {
 protected:
  TraceStateTest() {
    ShutdownTraceManager();
    RemoveMasterTraceHandler();
    SetDisableFileWrites(false);
    prefs_ = std::make_unique<TempPrefsDir>();
  }
  ~TraceStateTest() override {
    RemoveMasterTraceHandler();
    SetDisableFileWrites(true);
    ShutdownTraceManager();
    SetDisableFileWrites(false);
    prefs_.reset();
  }

  std::unique_ptr<TempPrefsDir> prefs_;
};

class RecordingHandler : public TraceHandler {
 public:
  void HandleTrace(const UTF8String& message) override {
    std::lock_guard<std::mutex> hold(lock_);
    messages_.push_back(Narrow(message));
  }
  std::vector<std::string> Messages() const {
    std::lock_guard<std::mutex> hold(lock_);
    return messages_;
  }

 private:
  mutable std::mutex lock_;
  std::vector<std::string> messages_;
};

}  // namespace kelcore::debug::testing
