#include <kelcore/filesupport/ByteStreamOperators.h>

#include <charconv>
#include <climits>
#include <cstdint>
#include <limits>
#include <stdexcept>

namespace kelcore::filesupport {
namespace {

template <int Bytes>
void PutBigEndian(OByteStream& out, std::uint64_t value) {
  for (int shift = (Bytes - 1) * 8; shift >= 0; shift -= 8) {
    out.Put(static_cast<unsigned char>(value >> shift));
  }
}

template <int Bytes>
std::uint64_t GetBigEndian(IByteStream& in) {
  std::uint64_t value = 0;
  for (int i = 0; i < Bytes; ++i) value = (value << 8) | in.Get();
  return value;
}

// Sign-extends the low `Bytes` bytes of `raw`.
template <int Bytes>
std::int64_t SignExtend(std::uint64_t raw) {
  constexpr int kUnused = 64 - Bytes * 8;
  return static_cast<std::int64_t>(raw << kUnused) >> kUnused;
}

// A corrupt length may ask for more than a string can hold.
template <typename Text>
void AppendUnit(Text& text, typename Text::value_type unit) {
  if (text.size() == text.max_size()) throw std::length_error("string too long");
  text.push_back(unit);
}

template <typename Text>
void PutText(OByteStream& out, const Text& text) {
  PutBigEndian<8>(out, text.size());
  for (const auto c : text) out.Put(static_cast<unsigned char>(c));
}

template <typename Text>
void GetText(IByteStream& in, Text& text) {
  text.clear();
  const std::uint64_t length = GetBigEndian<8>(in);
  for (std::uint64_t i = 0; i < length; ++i) {
    AppendUnit(text, static_cast<typename Text::value_type>(in.Get()));
  }
}

template <typename Float>
void PutFloat(OByteStream& out, Float value) {
  // 36 significant digits in general notation need at most 1 + 36 + 1 + 6 characters
  // ("-d.ddd...e+dddd"); room to spare.
  char text[64];
  const auto result =
      std::to_chars(text, text + sizeof text, value, std::chars_format::general, 36);
  PutBigEndian<8>(out, static_cast<std::uint64_t>(result.ptr - text));
  for (const char* p = text; p != result.ptr; ++p) out.Put(static_cast<unsigned char>(*p));
}

bool IsClassicSpace(char c) {
  return c == ' ' || c == '\t' || c == '\n' || c == '\v' || c == '\f' || c == '\r';
}

// Reads the text as the standard extractor would: leading white space and a '+' are
// accepted, trailing characters are ignored.
template <typename Float>
void GetFloat(IByteStream& in, Float& value) {
  std::string text;
  GetText(in, text);
  const char* first = text.data();
  const char* const last = first + text.size();
  while (first != last && IsClassicSpace(*first)) ++first;
  if (first != last && *first == '+' && last - first > 1 && first[1] != '-') ++first;
  Float parsed{};
  const auto result = std::from_chars(first, last, parsed, std::chars_format::general);
  if (result.ec == std::errc{}) value = parsed;
}

// Where long is wider than its 32-bit field, values outside the field are refused.
void CheckLongWidth(long value) {
  if constexpr (sizeof(long) > 4) {
    const auto wide = static_cast<long long>(value);
    if (wide < INT32_MIN || wide > INT32_MAX) throw value_width_error();
  }
}

void CheckLongWidth(unsigned long value) {
  if constexpr (sizeof(unsigned long) > 4) {
    if (static_cast<unsigned long long>(value) > UINT32_MAX) throw value_width_error();
  }
}

}  // namespace

OByteStream& operator<<(OByteStream& out, char value) {
  out.Put(static_cast<unsigned char>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, signed char value) {
  out.Put(static_cast<unsigned char>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, unsigned char value) {
  out.Put(value);
  return out;
}
OByteStream& operator<<(OByteStream& out, bool value) {
  out.Put(value ? 1 : 0);
  return out;
}
OByteStream& operator<<(OByteStream& out, boost::logic::tribool value) {
  out.Put(static_cast<unsigned char>(value.value));
  return out;
}
OByteStream& operator<<(OByteStream& out, short value) {
  PutBigEndian<2>(out, static_cast<std::uint16_t>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, unsigned short value) {
  PutBigEndian<2>(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, UTF16Char value) {
  PutBigEndian<2>(out, static_cast<std::uint16_t>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, unsigned int value) {
  static_assert(sizeof(unsigned int) == 4, "unsigned int is the 32-bit field");
  PutBigEndian<4>(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, long value) {
  CheckLongWidth(value);
  PutBigEndian<4>(out, static_cast<std::uint32_t>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, unsigned long value) {
  CheckLongWidth(value);
  PutBigEndian<4>(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, long long value) {
  PutBigEndian<8>(out, static_cast<std::uint64_t>(value));
  return out;
}
OByteStream& operator<<(OByteStream& out, unsigned long long value) {
  PutBigEndian<8>(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, const std::string& value) {
  PutText(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, const UTF8String& value) {
  PutText(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, const UTF16String& value) {
  PutBigEndian<8>(out, value.size());
  for (const UTF16Char unit : value) PutBigEndian<2>(out, static_cast<std::uint16_t>(unit));
  return out;
}
OByteStream& operator<<(OByteStream& out, float value) {
  PutFloat(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, double value) {
  PutFloat(out, value);
  return out;
}
OByteStream& operator<<(OByteStream& out, long double value) {
  PutFloat(out, value);
  return out;
}

IByteStream& operator>>(IByteStream& in, char& value) {
  value = static_cast<char>(in.Get());
  return in;
}
IByteStream& operator>>(IByteStream& in, signed char& value) {
  value = static_cast<signed char>(in.Get());
  return in;
}
IByteStream& operator>>(IByteStream& in, unsigned char& value) {
  value = in.Get();
  return in;
}
IByteStream& operator>>(IByteStream& in, bool& value) {
  value = in.Get() != 0;
  return in;
}
IByteStream& operator>>(IByteStream& in, boost::logic::tribool& value) {
  switch (in.Get()) {
    case 0:
      value = false;
      break;
    case 1:
      value = true;
      break;
    default:
      value = boost::logic::indeterminate;
      break;
  }
  return in;
}
IByteStream& operator>>(IByteStream& in, short& value) {
  value = static_cast<short>(SignExtend<2>(GetBigEndian<2>(in)));
  return in;
}
IByteStream& operator>>(IByteStream& in, unsigned short& value) {
  value = static_cast<unsigned short>(GetBigEndian<2>(in));
  return in;
}
IByteStream& operator>>(IByteStream& in, UTF16Char& value) {
  value = static_cast<UTF16Char>(GetBigEndian<2>(in));
  return in;
}
IByteStream& operator>>(IByteStream& in, unsigned int& value) {
  value = static_cast<unsigned int>(GetBigEndian<4>(in));
  return in;
}
IByteStream& operator>>(IByteStream& in, long& value) {
  value = static_cast<long>(SignExtend<4>(GetBigEndian<4>(in)));
  return in;
}
IByteStream& operator>>(IByteStream& in, unsigned long& value) {
  value = static_cast<unsigned long>(GetBigEndian<4>(in));
  return in;
}
IByteStream& operator>>(IByteStream& in, long long& value) {
  value = static_cast<long long>(GetBigEndian<8>(in));
  return in;
}
IByteStream& operator>>(IByteStream& in, unsigned long long& value) {
  value = GetBigEndian<8>(in);
  return in;
}
IByteStream& operator>>(IByteStream& in, std::string& value) {
  GetText(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, UTF8String& value) {
  GetText(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, UTF16String& value) {
  value.clear();
  const std::uint64_t length = GetBigEndian<8>(in);
  for (std::uint64_t i = 0; i < length; ++i) {
    AppendUnit(value, static_cast<UTF16Char>(GetBigEndian<2>(in)));
  }
  return in;
}
IByteStream& operator>>(IByteStream& in, float& value) {
  GetFloat(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, double& value) {
  GetFloat(in, value);
  return in;
}
IByteStream& operator>>(IByteStream& in, long double& value) {
  GetFloat(in, value);
  return in;
}

OByteStream& operator<<(OByteStream& out, IByteStream& in) {
  const unsigned long long length = in.Length();
  if (length == 0) {
    // Only the input's end stops the copy; a full output still raises.
    for (;;) {
      unsigned char byte;
      try {
        byte = in.Get();
      } catch (const eof_error&) {
        return out;
      }
      out.Put(byte);
    }
  }
  for (unsigned long long i = 0; i < length; ++i) out.Put(in.Get());
  return out;
}

}  // namespace kelcore::filesupport
