// A fixture for the persistence tests: installs the default XML parser factory and an
// error manager that records the last error raised and throws it as RaisedError.
#pragma once

#include <gtest/gtest.h>

#include <kelcore/config/ErrorManager.h>
#include <kelcore/xml/DefaultParserFactory.h>
#include <kelcore/xml/ParserFactorySlot.h>

#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace kelcore::proplist::testing {

// The whole content of the file at `path`; empty when it cannot be read.
inline std::string FileContent(const std::filesystem::path& path) {
  std::ifstream in(path, std::ios::binary);
  std::ostringstream content;
  if (in.is_open()) content << in.rdbuf();
  return content.str();
}

struct RaisedError {
  std::string key;
  long component = 0;
  long number = 0;
  UTF16String value1;
  UTF16String value2;
};

// Throws every error as RaisedError; with `defer`, records it in `deferred` and returns,
// as a manager does that reports errors later.
class RecordingErrorManager : public config::ErrorManager {
 public:
  bool defer = false;
  std::vector<RaisedError> deferred;

 protected:
  void DoThrowError(config::ErrorLevel, const char* key, unsigned long component, long errorNumber,
                    bool, const config::ReplacementValue& value1,
                    const config::ReplacementValue& value2, const config::ReplacementValue&,
                    const config::ReplacementValue&) override {
    RaisedError error{key, static_cast<long>(component), errorNumber, value1.Format(),
                      value2.Format()};
    if (!defer) throw error;
    deferred.push_back(error);
  }
};

class PersistenceTest : public ::testing::Test {
 protected:
  void SetUp() override {
    config::ErrorManager::Set(&manager_);
    xml::SetParserFactory(xml::CreateDefaultParserFactory());
  }
  void TearDown() override {
    xml::ResetParserFactory();
    config::ErrorManager::Set(nullptr);
    if (!directory_.empty()) {
      std::error_code ignored;
      std::filesystem::remove_all(directory_, ignored);
    }
  }

  // A fresh directory for this test, removed afterwards.
  const std::filesystem::path& Directory() {
    if (directory_.empty()) {
      std::string pattern = (std::filesystem::temp_directory_path() / "kelcore-plist-XXXXXX");
      if (::mkdtemp(pattern.data()) == nullptr) throw std::runtime_error("mkdtemp failed");
      directory_ = pattern;
    }
    return directory_;
  }
  UTF16String PathOf(const std::string& name) {
    const std::string path = (Directory() / name).string();
    return UTF16String(path.begin(), path.end());
  }

  // The error that `action` raises; fails the test when it raises none.
  template <class Action>
  RaisedError ErrorOf(Action action) {
    try {
      action();
    } catch (const RaisedError& error) {
      return error;
    }
    ADD_FAILURE() << "no error raised";
    return {};
  }

  RecordingErrorManager manager_;

 private:
  std::filesystem::path directory_;
};

}  // namespace kelcore::proplist::testing
