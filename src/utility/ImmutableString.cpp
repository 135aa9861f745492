#include <kelcore/utility/ImmutableString.h>

#include <kelcore/utility/UnicodeConversion.h>

#include <cstring>

namespace kelcore::utility {

namespace {

const unsigned char* Bytes(const char* text) {
  return reinterpret_cast<const unsigned char*>(text);
}

std::size_t MeasureBytes(const unsigned char* text) {
  return text == nullptr ? 0 : std::strlen(reinterpret_cast<const char*>(text));
}

// The comparison rule shared by every overload, for two texts that are not the same
// record; `b` holds `bLength` bytes.
int CompareBytes(const unsigned char* a, std::uint32_t aLength, const unsigned char* b,
                 std::size_t bLength) noexcept {
  if (aLength == 0) return bLength == 0 ? 0 : -1;
  if (bLength == 0) return 1;
  const std::size_t shorter = aLength < bLength ? aLength : bLength;
  const int result =
      std::strncmp(reinterpret_cast<const char*>(a), reinterpret_cast<const char*>(b), shorter);
  if (result != 0) return result;
  if (aLength == bLength) return 0;
  return aLength < bLength ? -1 : 1;
}

}  // namespace

const unsigned char ImmutableString::kEmptyText[1] = {0};

ImmutableString ImmutableString::CreateDynamic(const std::string& text) {
  return LookupOrCreate(Bytes(text.c_str()), std::strlen(text.c_str()), true);
}

ImmutableString ImmutableString::CreateDynamic(const UTF8String& text) {
  return LookupOrCreate(text.c_str(), MeasureBytes(text.c_str()), true);
}

ImmutableString ImmutableString::CreateDynamic(const UTF16String& text) {
  return CreateDynamic(UTF16to8(text));
}

ImmutableString ImmutableString::CreateDynamic(const char* text) {
  return CreateDynamic(Bytes(text));
}

ImmutableString ImmutableString::CreateDynamic(const unsigned char* text) {
  return LookupOrCreate(text, MeasureBytes(text), true);
}

ImmutableString ImmutableString::CreateDynamic(const unsigned char* text, std::size_t length) {
  return LookupOrCreate(text, length, true);
}

ImmutableString ImmutableString::CreateDynamic(const UTF16Char* text) {
  if (text == nullptr) return ImmutableString();
  return CreateDynamic(UTF16to8(text));
}

ImmutableString ImmutableString::CreateStatic(const char* text) {
  return CreateStatic(Bytes(text));
}

ImmutableString ImmutableString::CreateStatic(const unsigned char* text) {
  return LookupOrCreate(text, MeasureBytes(text), false);
}

int ImmutableString::Compare(const ImmutableString& other) const noexcept {
  if (rep_ == other.rep_) return 0;
  return CompareBytes(data_, length_, other.data_, other.length_);
}

int ImmutableString::Compare(const std::string& other) const noexcept {
  return Compare(other.c_str());
}

int ImmutableString::Compare(const UTF8String& other) const noexcept {
  return Compare(other.c_str());
}

int ImmutableString::Compare(const UTF16String& other) const {
  return Compare(UTF16to8(other));
}

int ImmutableString::Compare(const char* other) const noexcept {
  return Compare(Bytes(other));
}

int ImmutableString::Compare(const unsigned char* other) const noexcept {
  return CompareBytes(data_, length_, other, MeasureBytes(other));
}

int ImmutableString::Compare(const UTF16Char* other) const {
  if (other == nullptr) return Compare(static_cast<const unsigned char*>(nullptr));
  return Compare(UTF16to8(other));
}

UTF16String ImmutableString::ToString() const {
  return UTF8to16(UTF8String(data_, std::strlen(CStr())));
}

}  // namespace kelcore::utility
