// Shared pieces of the configuration tests: a fixture that leaves every process-wide
// slot as it found it, text helpers, and a manager that records what it is asked.
#pragma once

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/Localizer.h>
#include <kelcore/utility/Locale.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <gtest/gtest.h>

#include <stdexcept>
#include <string>
#include <vector>

namespace kelcore::config::testing {

// UTF-8 test text as UTF16String.
inline UTF16String U16(const char* utf8) {
  return utility::UTF8to16(UTF8String(utility::AsciiToUTF8Impl(utf8)));
}

inline std::string U8(const UTF16String& text) {
  const UTF8String utf8 = utility::UTF16to8(text);
  return std::string(utf8.begin(), utf8.end());
}

// Every test starts and ends with no manager, no localizer, no language and no
// identity.
class ConfigTest : public ::testing::Test {
 protected:
  void SetUp() override { ResetSlots(); }
  void TearDown() override { ResetSlots(); }

  static void ResetSlots() {
    ErrorManager::Set(nullptr);
    Localizer::Set(nullptr);
    utility::Locale::SetApplicationLangauge(UTF16String());
    ResetClientIdentity();
  }
};

// Thrown by RecordingManager::DoThrowError.
struct RaisedError : std::runtime_error {
  RaisedError(long number, bool deferralAllowed)
      : std::runtime_error("raised"), errorNumber(number), deferral(deferralAllowed) {}
  long errorNumber;
  bool deferral;
};

// Counts its raise calls; throws RaisedError unless the error is being deferred.
class RecordingManager : public ErrorManager {
 public:
  int raiseCount = 0;
  int purgeCount = 0;
  bool purgeAnswer = false;

  using ErrorManager::GetCurrentErrorReporterForThisThread;

  bool PurgeMemory(unsigned int) override {
    ++purgeCount;
    return purgeAnswer;
  }

 protected:
  void DoThrowError(ErrorLevel, const char*, unsigned long, long errorNumber, bool deferralAllowed,
                    const ReplacementValue&, const ReplacementValue&, const ReplacementValue&,
                    const ReplacementValue&) override {
    ++raiseCount;
    if (deferralAllowed && IsCurrentErrorRecorded()) return;
    throw RaisedError(errorNumber, deferralAllowed);
  }
};

// Answers with the default text and remembers the folders it was asked to load.
class RecordingLocalizer : public Localizer {
 public:
  std::vector<UTF16String> loadedFolders;

  UTF16String LocalizeString(const char* key) override {
    const std::string whole(key);
    return U16(whole.substr(whole.find('=') + 1).c_str());
  }
  void LoadDictionary(const UTF16String& folder) override { loadedFolders.push_back(folder); }
};

}  // namespace kelcore::config::testing
