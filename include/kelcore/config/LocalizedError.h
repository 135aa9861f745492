// The exception that kelcore::config::DefaultErrorManager throws for an error raised
// through ThrowError.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/Errors.h>
#include <kelcore/utility/StringTypes.h>

#include <cstdint>
#include <exception>
#include <memory>
#include <string>

namespace kelcore::config {

// Carries the error's level, key, component, error number and its message with the
// replacement values filled in. Copies share one immutable record, so copying never
// throws; an object may be read from any thread.
class KELCORE_API LocalizedError : public std::exception {
 public:
  LocalizedError(ErrorLevel level, std::string key, std::uint32_t component,
                 std::int32_t errorNumber, UTF16String message);

  ErrorLevel GetLevel() const noexcept;
  // The localization key, default text included.
  const std::string& GetKey() const noexcept;
  std::uint32_t GetComponent() const noexcept;
  std::int32_t GetErrorNumber() const noexcept;
  const UTF16String& GetLocalizedMessage() const noexcept;
  // The message in UTF-8.
  const char* what() const noexcept override;

 private:
  struct Record;
  std::shared_ptr<const Record> record_;
};

}  // namespace kelcore::config
