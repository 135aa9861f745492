#include <kelcore/utility/Base64.h>

#include <cstdint>
#include <exception>
#include <vector>

namespace kelcore::utility {
namespace {

constexpr char kAlphabet[] = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
constexpr std::uint64_t kLongestText = 0xFFFFFFFE;

// Values of the text's characters: 0-63, kPadding for "=", kInvalid for the rest.
constexpr unsigned char kPadding = 64;
constexpr unsigned char kInvalid = 255;

struct DecodingTable {
  unsigned char values[256];
  constexpr DecodingTable() : values() {
    for (unsigned char& value : values) value = kInvalid;
    for (unsigned i = 0; i < 64; ++i)
      values[static_cast<unsigned char>(kAlphabet[i])] = static_cast<unsigned char>(i);
    values[static_cast<unsigned char>('=')] = kPadding;
  }
};
constexpr DecodingTable kDecoding;

// Abandons a decoding from wherever the bad character is met; never leaves this file.
class exBase64InvalidCharacter : public std::exception {
 public:
  const char* what() const noexcept override { return "invalid character in Base64 text"; }
};

bool IsWhiteSpace(unsigned char c) {
  return c == ' ' || (c >= '\t' && c <= '\r');
}

// The value of a slot; a slot past the end of the text holds 0, which is invalid too.
unsigned SlotValue(unsigned char c) {
  const unsigned value = kDecoding.values[c];
  if (value == kInvalid) throw exBase64InvalidCharacter();
  return value;
}

// Writes the 4 * ((size + 2) / 3) characters of `size` bytes to `out`.
template <class Char>
void Encode(const unsigned char* data, std::size_t size, Char* out) {
  auto put = [&out](unsigned sextet) { *out++ = static_cast<Char>(kAlphabet[sextet & 0x3F]); };
  std::size_t i = 0;
  for (; size - i >= 3; i += 3) {
    const unsigned group = (unsigned{data[i]} << 16) | (unsigned{data[i + 1]} << 8) | data[i + 2];
    put(group >> 18);
    put(group >> 12);
    put(group >> 6);
    put(group);
  }
  if (size - i == 1) {
    put(data[i] >> 2);
    put(data[i] << 4);
    *out++ = '=';
    *out++ = '=';
  } else if (size - i == 2) {
    const unsigned group = (unsigned{data[i]} << 8) | data[i + 1];
    put(group >> 10);
    put(group >> 4);
    put(group << 2);
    *out++ = '=';
  }
}

// The encoded length of `size` bytes, or 0 when it would exceed kLongestText.
std::uint64_t EncodedLength(std::uint64_t size) {
  const std::uint64_t length = (size + 2) / 3 * 4;
  return length > kLongestText ? 0 : length;
}

// Decodes `size` characters into `out` (appended); throws exBase64InvalidCharacter.
void Decode(const unsigned char* text, std::size_t size, ByteVector& out) {
  std::size_t i = 0;
  while (i < size) {
    unsigned slots[4];
    for (unsigned& slot : slots) {
      while (i < size && IsWhiteSpace(text[i])) ++i;
      if (i == size && &slot == slots) return;  // only white space was left
      slot = SlotValue(i < size ? text[i++] : 0);
    }
    // Padding may end a group only in its last two slots.
    if (slots[0] == kPadding || slots[1] == kPadding) throw exBase64InvalidCharacter();
    out.push_back(static_cast<unsigned char>((slots[0] << 2) | (slots[1] >> 4)));
    if (slots[2] == kPadding) continue;
    out.push_back(static_cast<unsigned char>((slots[1] << 4) | (slots[2] >> 2)));
    if (slots[3] == kPadding) continue;
    out.push_back(static_cast<unsigned char>((slots[2] << 6) | slots[3]));
  }
}

}  // namespace

bool EncodeBinaryDataToUTF8String(const unsigned char* data, unsigned int size, UTF8String& out) {
  out.clear();
  if (size == 0) return true;
  const std::uint64_t length = EncodedLength(size);
  if (length == 0 || data == nullptr) return false;
  out.resize(static_cast<std::size_t>(length));
  Encode(data, size, out.data());
  return true;
}

bool DecodeBinaryDataFromUTF8String(const UTF8String& text, ByteVector& out) {
  out.clear();
  ByteVector work;
  work.reserve(text.size() / 4 * 3);
  try {
    Decode(text.data(), text.size(), work);
  } catch (const exBase64InvalidCharacter&) {
    return false;
  }
  out.swap(work);
  return true;
}

std::string EncodeUTF16ToAscii(const UTF16String& text) {
  std::string result;
  const std::uint64_t length = EncodedLength(std::uint64_t{text.size()} * 2);
  if (length == 0) return result;  // empty, or too long to encode
  std::vector<unsigned char> bytes;
  bytes.reserve(text.size() * 2);
  for (const UTF16Char unit : text) {
    bytes.push_back(static_cast<unsigned char>(unit & 0xFF));
    bytes.push_back(static_cast<unsigned char>(unit >> 8));
  }
  result.resize(static_cast<std::size_t>(length));
  Encode(bytes.data(), bytes.size(), result.data());
  return result;
}

UTF16String DecodeUTF16FromAscii(const std::string& text) {
  UTF16String result;
  const std::size_t length = text.find('\0');
  ByteVector bytes;
  bytes.reserve(text.size() / 4 * 3);
  try {
    Decode(reinterpret_cast<const unsigned char*>(text.data()),
           length == std::string::npos ? text.size() : length, bytes);
  } catch (const exBase64InvalidCharacter&) {
    return result;
  }
  result.resize(bytes.size() / 2);
  for (std::size_t i = 0; i < result.size(); ++i) {
    result[i] = static_cast<UTF16Char>(bytes[2 * i] | (bytes[2 * i + 1] << 8));
  }
  return result;
}

}  // namespace kelcore::utility
