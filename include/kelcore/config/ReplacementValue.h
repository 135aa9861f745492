// One typed value for one of the placeholders "^1" to "^4" of an error message.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <cstdint>

namespace kelcore::config {

enum ReplacementKind : std::int32_t {
  kReplacementNone = 0,
  kReplacementSigned = 1,
  kReplacementUnsigned = 2,
  kReplacementDouble = 3,
  kReplacementString = 4,
};

// A value of one kind: a signed or unsigned 64-bit integer, a double, a UTF16String, or
// none (the placeholder stays in the text). The numeric field of the value's kind is
// set and the others are 0; a string value owns its own heap copy of the string.
//
// Copies (construction and assignment) copy every field and give the copy its own copy
// of the string; a moved-from value has kind none. Not thread-safe: one value, one
// thread at a time; distinct values are independent.
class KELCORE_API ReplacementValue {
 public:
  ReplacementValue() noexcept = default;
  ReplacementValue(int value) noexcept;                 // kind signed
  ReplacementValue(long value) noexcept;                // kind signed
  ReplacementValue(long long value) noexcept;           // kind signed
  ReplacementValue(unsigned int value) noexcept;        // kind unsigned
  ReplacementValue(unsigned long value) noexcept;       // kind unsigned
  ReplacementValue(unsigned long long value) noexcept;  // kind unsigned
  ReplacementValue(double value) noexcept;              // kind double
  ReplacementValue(const UTF16String& value);           // kind string
  // Kind string; a null pointer gives an empty string.
  ReplacementValue(const UTF16Char* value);

  ReplacementValue(const ReplacementValue& other);
  ReplacementValue(ReplacementValue&& other) noexcept;
  // Values without strings are copied inline: raising an error copies four of them.
  ReplacementValue& operator=(const ReplacementValue& other) {
    if (string_ != nullptr || other.string_ != nullptr) return AssignWithStrings(other);
    kind_ = other.kind_;
    unsignedValue_ = other.unsignedValue_;
    signedValue_ = other.signedValue_;
    doubleValue_ = other.doubleValue_;
    return *this;
  }
  ReplacementValue& operator=(ReplacementValue&& other) noexcept;
  ~ReplacementValue() {
    if (string_ != nullptr) ReleaseString();
  }

  ReplacementKind GetKind() const noexcept { return kind_; }
  std::int64_t GetSigned() const noexcept { return signedValue_; }
  std::uint64_t GetUnsigned() const noexcept { return unsignedValue_; }
  double GetDouble() const noexcept { return doubleValue_; }
  // A copy of the string for kind string, else an empty string.
  UTF16String GetString() const;

  // The value as it appears in a message: integers in plain decimal, doubles in the
  // default notation with six significant digits (29.2334, 1e+20), strings as they
  // are; empty for kind none. Numbers use the classic "C" locale.
  UTF16String Format() const;

  // Zeroes the three numeric fields and the string pointer, leaving the kind alone and
  // not releasing the string: for freshly made values only. On a string value it leaks
  // the string, and GetString then gives an empty string.
  void Init() noexcept;

 private:
  ReplacementValue& AssignWithStrings(const ReplacementValue& other);
  void ReleaseString() noexcept;

  ReplacementKind kind_ = kReplacementNone;
  std::uint64_t unsignedValue_ = 0;
  std::int64_t signedValue_ = 0;
  double doubleValue_ = 0;
  UTF16String* string_ = nullptr;
};

}  // namespace kelcore::config
