#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/LocalizedError.h>

namespace kelcore::config {

DefaultErrorManager::DefaultErrorManager() = default;

DefaultErrorManager::~DefaultErrorManager() = default;

void DefaultErrorManager::DoThrowError(ErrorLevel level, const char* key, unsigned long component,
                                       long errorNumber, bool deferralAllowed,
                                       const ReplacementValue& value1,
                                       const ReplacementValue& value2,
                                       const ReplacementValue& value3,
                                       const ReplacementValue& value4) {
  if (deferralAllowed && IsCurrentErrorRecorded()) return;
  throw LocalizedError(level, key != nullptr ? key : "", static_cast<std::uint32_t>(component),
                       static_cast<std::int32_t>(errorNumber),
                       SubstituteErrorMessage(key, value1, value2, value3, value4));
}

}  // namespace kelcore::config
