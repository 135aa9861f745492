#include <kelcore/utility/Locale.h>

#include <algorithm>
#include <mutex>
#include <stdexcept>

namespace kelcore::utility::Locale {
namespace {

constexpr std::size_t kMaxLanguageLength = 64;

std::mutex& LanguageMutex() {
  static std::mutex mutex;
  return mutex;
}

UTF16String& StoredLanguage() {
  static UTF16String language;
  return language;
}

bool IsLanguageUnit(UTF16Char unit) {
  return (unit >= 'a' && unit <= 'z') || (unit >= 'A' && unit <= 'Z') ||
         (unit >= '0' && unit <= '9') || unit == '-' || unit == '_';
}

}  // namespace

bool IsInitialized() {
  std::lock_guard<std::mutex> lock(LanguageMutex());
  return !StoredLanguage().empty();
}

UTF16String ApplicationLangauge() {
  std::lock_guard<std::mutex> lock(LanguageMutex());
  return StoredLanguage();
}

void SetApplicationLangauge(const UTF16String& language) {
  if (language.size() > kMaxLanguageLength ||
      !std::all_of(language.begin(), language.end(), IsLanguageUnit)) {
    throw std::invalid_argument(
        "kelcore::utility::Locale: a language code holds only ASCII letters, digits, '-' and "
        "'_' (at most 64)");
  }
  std::lock_guard<std::mutex> lock(LanguageMutex());
  StoredLanguage() = language;
}

}  // namespace kelcore::utility::Locale
