// A 128-bit globally unique identifier with a fixed text form and a big-endian byte form.
//
// Fields, in the platform's GUID layout: data1 (32-bit), data2 (16-bit), data3 (16-bit)
// and data4 (8 bytes).
//
// Text form: 36 characters of lower-case hexadecimal without braces,
//   data1 (8 digits) "-" data2 (4) "-" data3 (4) "-" data4[0..1] (4) "-" data4[2..7] (12),
// e.g. "12345678-9abc-def0-0102-030405060708".
// Byte form: 16 bytes, data1 big-endian, data2 big-endian, data3 big-endian, then the
// eight bytes of data4 in order. Both forms are the same on every platform.
//
// Parsing is lenient by design and checks nothing but the length:
// - an absent (null) or empty text gives the all-zero Guid;
// - a text of 1 to 35 characters is refused: the constructors throw
//   std::invalid_argument, Parse returns false, stream extraction sets failbit;
// - otherwise only the first 36 characters are looked at. The hexadecimal digits at
//   positions 0-7, 9-12, 14-17, 19-22 and 24-35 are read high digit first, two digits a
//   byte; "0"-"9", "A"-"F" and "a"-"f" have their values and every other character
//   (including anything that is not 7-bit) reads as 0. The characters at positions 8,
//   13, 18 and 23 are not looked at, so any separator is accepted.
// UTF-16 text is converted to UTF-8 first, so a non-ASCII character takes the positions
// of its UTF-8 bytes.
//
// Comparison is by value; the order is that of the byte form (data1, data2, data3, then
// data4 byte by byte). std::hash<Guid> is provided.
//
// A Guid is a plain value: copyable, no shared state. CreateUnique may be called on any
// thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringStreams.h>
#include <kelcore/utility/StringTypes.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <array>
#include <compare>
#include <cstddef>
#include <cstdint>
#include <functional>
#include <istream>
#include <ostream>
#include <string>
#include <string_view>
#include <type_traits>

namespace kelcore::utility {

class KELCORE_API Guid {
 public:
  static constexpr std::size_t kTextLength = 36;
  static constexpr std::size_t kByteLength = 16;

  // The all-zero Guid.
  Guid() = default;
  Guid(std::uint32_t data1, std::uint16_t data2, std::uint16_t data3, unsigned char b0,
       unsigned char b1, unsigned char b2, unsigned char b3, unsigned char b4, unsigned char b5,
       unsigned char b6, unsigned char b7);
  // Parse the text form (see above); a text of 1 to 35 characters throws
  // std::invalid_argument. A null pointer gives the all-zero Guid.
  explicit Guid(const std::string& text);
  explicit Guid(const char* text);
  explicit Guid(const UTF8String& text);
  explicit Guid(const UTF16String& text);

  // A new random (version 4) Guid from the system's generator. When the generator fails,
  // raises the non-fatal error 27 of component 105 ("Couldn't create Guid.", deferral
  // allowed) through kelcore::config::ThrowError; if the error manager returns, the
  // result holds whatever the generator produced (zeros where it produced nothing).
  static Guid CreateUnique();

  // Parses `text` into `out` as the constructors do; returns false, leaving `out`
  // unchanged, for a text of 1 to 35 characters.
  static bool Parse(std::string_view text, Guid& out);

  UTF16String AsString() const;
  UTF8String AsUTF8String() const;

  // The byte form. `out16` / `in16` must point to 16 bytes.
  static void GuidToBytes(const Guid& guid, unsigned char* out16);
  static void GuidFromBytes(Guid& guid, const unsigned char* in16);

  static void GuidToComponents(const Guid& guid, std::uint32_t& data1, std::uint16_t& data2,
                               std::uint16_t& data3, unsigned char& b0, unsigned char& b1,
                               unsigned char& b2, unsigned char& b3, unsigned char& b4,
                               unsigned char& b5, unsigned char& b6, unsigned char& b7);

  // A hash of all 128 bits; the same value on every run of the same build.
  std::size_t Hash() const noexcept;

  friend bool operator==(const Guid&, const Guid&) = default;
  friend std::strong_ordering operator<=>(const Guid&, const Guid&) = default;

 private:
  std::uint32_t data1_ = 0;
  std::uint16_t data2_ = 0;
  std::uint16_t data3_ = 0;
  std::array<unsigned char, 8> data4_{};
};

namespace guid_detail {

// Code units of the standard streams that Guid reads and writes: narrow, 8-bit unsigned
// and UTF-16 (on Windows that is wchar_t, the wide streams).
template <class CharT>
concept StreamUnit = std::is_same_v<CharT, char> || std::is_same_v<CharT, unsigned char> ||
    std::is_same_v<CharT, UTF16Char>;

template <class CharT, class Traits>
std::string ToNarrowWord(const std::basic_string<CharT, Traits>& word) {
  if constexpr (std::is_same_v<CharT, UTF16Char>) {
    const UTF8String utf8 = UTF16to8(UTF16String(word.begin(), word.end()));
    return std::string(utf8.begin(), utf8.end());
  } else {
    return std::string(word.begin(), word.end());
  }
}

}  // namespace guid_detail

// Writes the text form. Narrow streams honour width() and fill() as for a string; the
// other streams write the 36 units straight to the buffer (badbit when it takes fewer).
template <guid_detail::StreamUnit CharT, class Traits>
std::basic_ostream<CharT, Traits>& operator<<(std::basic_ostream<CharT, Traits>& out,
                                              const Guid& guid) {
  const UTF8String text = guid.AsUTF8String();
  if constexpr (std::is_same_v<CharT, char>) {
    out << std::string_view(reinterpret_cast<const char*>(text.data()), text.size());
  } else {
    const typename std::basic_ostream<CharT, Traits>::sentry ready(out);
    if (ready) {
      std::array<CharT, Guid::kTextLength> units{};
      for (std::size_t i = 0; i < units.size(); ++i) units[i] = static_cast<CharT>(text[i]);
      const auto count = static_cast<std::streamsize>(units.size());
      if (out.rdbuf()->sputn(units.data(), count) != count) out.setstate(std::ios_base::badbit);
      out.width(0);
    }
  }
  return out;
}

// Reads one word, delimited by the classic whitespace (space, TAB, LF, VT, FF, CR), and
// parses it. Sets failbit, leaving `guid` unchanged, when no word is left or the word has
// fewer than 36 characters; eofbit when the stream ends the word.
template <guid_detail::StreamUnit CharT, class Traits>
std::basic_istream<CharT, Traits>& operator>>(std::basic_istream<CharT, Traits>& in, Guid& guid) {
  // No locale facets here: the 8-bit unsigned and UTF-16 streams have none.
  const typename std::basic_istream<CharT, Traits>::sentry ready(in, true);
  if (!ready) return in;
  std::basic_streambuf<CharT, Traits>* buffer = in.rdbuf();
  std::basic_string<CharT, Traits> word;
  auto unit = buffer->sgetc();
  const auto isSpace = [](typename Traits::int_type value) {
    return !Traits::eq_int_type(value, Traits::eof()) &&
           stream_detail::IsClassicSpace(static_cast<std::uint32_t>(value));
  };
  while (isSpace(unit)) unit = buffer->snextc();
  while (!Traits::eq_int_type(unit, Traits::eof()) && !isSpace(unit)) {
    word.push_back(Traits::to_char_type(unit));
    unit = buffer->snextc();
  }
  std::ios_base::iostate state = std::ios_base::goodbit;
  if (Traits::eq_int_type(unit, Traits::eof())) state |= std::ios_base::eofbit;
  if (word.empty() || !Guid::Parse(guid_detail::ToNarrowWord(word), guid)) {
    state |= std::ios_base::failbit;
  }
  in.setstate(state);
  return in;
}

// The library's UTF-8 and UTF-16 string streams print a Guid through their generic
// insertion (which uses the narrow operator<< above). Extraction (input streams only)
// reads one word as above.
template <class CharT, class Traits, StringStreamMode Mode>
BasicStringStream<CharT, Traits, Mode>& operator>>(BasicStringStream<CharT, Traits, Mode>& in,
                                                   Guid& guid) {
  std::basic_string<CharT, Traits> word;
  if (in >> word && !Guid::Parse(guid_detail::ToNarrowWord(word), guid)) {
    in.setstate(std::ios_base::failbit);
  }
  return in;
}

}  // namespace kelcore::utility

template <>
struct std::hash<kelcore::utility::Guid> {
  std::size_t operator()(const kelcore::utility::Guid& guid) const noexcept { return guid.Hash(); }
};
