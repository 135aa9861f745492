#include <kelcore/config/LocalizedError.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <utility>

namespace kelcore::config {

struct LocalizedError::Record {
  ErrorLevel level;
  std::string key;
  std::uint32_t component;
  std::int32_t errorNumber;
  UTF16String message;
  std::string messageUTF8;
};

LocalizedError::LocalizedError(ErrorLevel level, std::string key, std::uint32_t component,
                               std::int32_t errorNumber, UTF16String message) {
  const UTF8String utf8 = utility::UTF16to8(message);
  record_ = std::make_shared<const Record>(Record{level, std::move(key), component, errorNumber,
                                                  std::move(message),
                                                  std::string(utf8.begin(), utf8.end())});
}

ErrorLevel LocalizedError::GetLevel() const noexcept {
  return record_->level;
}
const std::string& LocalizedError::GetKey() const noexcept {
  return record_->key;
}
std::uint32_t LocalizedError::GetComponent() const noexcept {
  return record_->component;
}
std::int32_t LocalizedError::GetErrorNumber() const noexcept {
  return record_->errorNumber;
}
const UTF16String& LocalizedError::GetLocalizedMessage() const noexcept {
  return record_->message;
}
const char* LocalizedError::what() const noexcept {
  return record_->messageUTF8.c_str();
}

}  // namespace kelcore::config
