#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/Errors.h>
#include <kelcore/config/Localizer.h>

#include <array>

namespace kelcore::config {
namespace {

constexpr const char* kFatalTestKey =
    "$$$/kelcore/config/Error/test/fataltest=This is a fatal exception.";
constexpr const char* kNonFatalTestKey =
    "$$$/kelcore/config/Error/test/nonfataltest=This is a non-fatal exception. int:^1, "
    "uint:^2, double:^3";
constexpr unsigned long kConfigurationComponent = 100;
constexpr long kFatalTestError = 21;
constexpr long kNonFatalTestError = 20;

std::size_t FindPlaceholder(const UTF16String& text, UTF16Char digit) {
  for (std::size_t at = text.find('^'); at != UTF16String::npos; at = text.find('^', at + 1)) {
    if (at + 1 < text.size() && text[at + 1] == digit) return at;
  }
  return UTF16String::npos;
}

}  // namespace

void ThrowError(ErrorLevel level, const char* key, unsigned long component, long errorNumber,
                bool deferralAllowed, const ReplacementValue& value1,
                const ReplacementValue& value2, const ReplacementValue& value3,
                const ReplacementValue& value4) {
  ErrorManager::Get(false)->ThrowErrorDispatch(level, key, component, errorNumber, deferralAllowed,
                                               value1, value2, value3, value4);
}

UTF16String SubstituteErrorMessage(const char* key, const ReplacementValue& value1,
                                   const ReplacementValue& value2, const ReplacementValue& value3,
                                   const ReplacementValue& value4) {
  UTF16String text = Localizer::Get()->LocalizeString(key);
  const std::array<const ReplacementValue*, 4> values = {&value1, &value2, &value3, &value4};
  for (std::size_t i = 0; i < values.size(); ++i) {
    if (values[i]->GetKind() == kReplacementNone) continue;
    const std::size_t at = FindPlaceholder(text, static_cast<UTF16Char>('1' + i));
    if (at == UTF16String::npos) continue;
    text.replace(at, 2, values[i]->Format());
  }
  return text;
}

void TestThrowError(bool fatal) {
  if (fatal) {
    ThrowError(kErrorLevelFatal, kFatalTestKey, kConfigurationComponent, kFatalTestError, true);
  } else {
    ThrowError(kErrorLevelNonFatal, kNonFatalTestKey, kConfigurationComponent, kNonFatalTestError,
               true, ReplacementValue(-2147483648LL), ReplacementValue(4294967295ULL),
               ReplacementValue(29.2334));
  }
}

}  // namespace kelcore::config
