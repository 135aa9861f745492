#include <kelcore/config/ReplacementValue.h>
#include <kelcore/utility/StringStreams.h>

#include <utility>

namespace kelcore::config {

ReplacementValue::ReplacementValue(int value) noexcept
    : ReplacementValue(static_cast<long long>(value)) {}
ReplacementValue::ReplacementValue(long value) noexcept
    : ReplacementValue(static_cast<long long>(value)) {}
ReplacementValue::ReplacementValue(long long value) noexcept
    : kind_(kReplacementSigned), signedValue_(value) {}

ReplacementValue::ReplacementValue(unsigned int value) noexcept
    : ReplacementValue(static_cast<unsigned long long>(value)) {}
ReplacementValue::ReplacementValue(unsigned long value) noexcept
    : ReplacementValue(static_cast<unsigned long long>(value)) {}
ReplacementValue::ReplacementValue(unsigned long long value) noexcept
    : kind_(kReplacementUnsigned), unsignedValue_(value) {}

ReplacementValue::ReplacementValue(double value) noexcept
    : kind_(kReplacementDouble), doubleValue_(value) {}

ReplacementValue::ReplacementValue(const UTF16String& value)
    : kind_(kReplacementString), string_(new UTF16String(value)) {}

ReplacementValue::ReplacementValue(const UTF16Char* value)
    : kind_(kReplacementString),
      string_(value != nullptr ? new UTF16String(value) : new UTF16String()) {}

ReplacementValue::ReplacementValue(const ReplacementValue& other)
    : kind_(other.kind_),
      unsignedValue_(other.unsignedValue_),
      signedValue_(other.signedValue_),
      doubleValue_(other.doubleValue_),
      string_(other.string_ != nullptr ? new UTF16String(*other.string_) : nullptr) {}

ReplacementValue::ReplacementValue(ReplacementValue&& other) noexcept
    : kind_(std::exchange(other.kind_, kReplacementNone)),
      unsignedValue_(std::exchange(other.unsignedValue_, 0)),
      signedValue_(std::exchange(other.signedValue_, 0)),
      doubleValue_(std::exchange(other.doubleValue_, 0.0)),
      string_(std::exchange(other.string_, nullptr)) {}

ReplacementValue& ReplacementValue::AssignWithStrings(const ReplacementValue& other) {
  if (this == &other) return *this;
  // Copy first, so that a failed allocation leaves this value as it was.
  UTF16String* copy = other.string_ != nullptr ? new UTF16String(*other.string_) : nullptr;
  delete string_;
  string_ = copy;
  kind_ = other.kind_;
  unsignedValue_ = other.unsignedValue_;
  signedValue_ = other.signedValue_;
  doubleValue_ = other.doubleValue_;
  return *this;
}

ReplacementValue& ReplacementValue::operator=(ReplacementValue&& other) noexcept {
  if (this == &other) return *this;
  delete string_;
  kind_ = std::exchange(other.kind_, kReplacementNone);
  unsignedValue_ = std::exchange(other.unsignedValue_, 0);
  signedValue_ = std::exchange(other.signedValue_, 0);
  doubleValue_ = std::exchange(other.doubleValue_, 0.0);
  string_ = std::exchange(other.string_, nullptr);
  return *this;
}

void ReplacementValue::ReleaseString() noexcept {
  delete string_;
  string_ = nullptr;
}

UTF16String ReplacementValue::GetString() const {
  return kind_ == kReplacementString && string_ != nullptr ? *string_ : UTF16String();
}

UTF16String ReplacementValue::Format() const {
  utility::oUTF16StringStream text;
  switch (kind_) {
    case kReplacementSigned:
      text << signedValue_;
      break;
    case kReplacementUnsigned:
      text << unsignedValue_;
      break;
    case kReplacementDouble:
      text << doubleValue_;
      break;
    case kReplacementString:
      return GetString();
    case kReplacementNone:
      break;
  }
  return text.str();
}

void ReplacementValue::Init() noexcept {
  unsignedValue_ = 0;
  signedValue_ = 0;
  doubleValue_ = 0;
  string_ = nullptr;
}

}  // namespace kelcore::config
