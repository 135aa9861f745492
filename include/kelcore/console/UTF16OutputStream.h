// An output stream of UTF-16 text: where console commands write their answers.
//
// The stream formats what is inserted into UTF-16 and hands it to a target:
//   - a UTF16String that the caller owns (the text is appended to it at once);
//   - the process's terminal (Terminal(): the text is converted to UTF-8 and written to
//     the C standard output, a line at a time);
//   - the console log file (LogFile(): each line is written to
//     ConsoleLogFile::WriteToLog as UTF-8);
//   - any Target of the host's own.
//
//   UTF16String answer;
//   UTF16OutputStream out(answer);
//   out << u"volume " << 7 << " of " << 2.5 << endl;   // answer == u"volume 7 of 2.5\n"
//
// What can be inserted:
//   - UTF-16 text: UTF16String, UTF16StringView, const UTF16Char* (NUL-terminated),
//     a single UTF16Char. Units are copied as they are, unpaired surrogates included.
//   - UTF-8 text: UTF8String, std::string, std::string_view, const char* (NUL-terminated),
//     a single char. It is decoded as UTF-8 (so 7-bit text is copied unit for unit);
//     invalid bytes convert as UTF8to16 converts them.
//   - Numbers: every integer type (short to unsigned long long, and bool as 1 or 0), in
//     decimal with a leading '-' when negative; float and double in the shortest
//     general notation of six significant digits, as printf's "%g" and the classic
//     locale's default stream notation write them ("29.2334", "1e+20", "0.5", "inf",
//     "nan"). Numbers never depend on the global locale.
//   - Manipulators: endl writes a line end ("\n") and flushes; flush flushes. std::endl
//     and std::flush are accepted with the same meaning.
// A null const char* or const UTF16Char* writes nothing. Character types other than char
// and UTF16Char (signed char, unsigned char, char8_t, char32_t, wchar_t where it is not
// UTF16Char) do not compile, so that no byte is silently printed as a number.
//
// Flushing hands buffered text to the target's destination: the terminal and log targets
// keep text until a line end, a flush or the stream's destruction (a partial line then
// goes out as it is). The string target has nothing to flush.
//
// Not thread-safe: one thread per stream. The terminal target writes each line with one
// C stdio call, so lines from several streams never interleave within a line. The
// stream is movable, not copyable; the UTF16String given to the constructor must outlive
// it.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <concepts>
#include <cstddef>
#include <memory>
#include <ostream>
#include <string>
#include <string_view>
#include <type_traits>

namespace kelcore::console {

// A view of UTF-16 units (std::u16string_view where UTF16Char is char16_t).
using UTF16StringView = std::basic_string_view<UTF16Char>;

class KELCORE_API UTF16OutputStream {
 public:
  // Where a stream's text goes. Write receives the text in order, in pieces of any size
  // (a surrogate pair may be split between two pieces); Flush marks a point where
  // everything written so far should reach the destination.
  class KELCORE_API Target {
   public:
    virtual ~Target();
    virtual void Write(UTF16StringView text) = 0;
    virtual void Flush();
  };

  // Appends to `buffer`, which must outlive the stream.
  explicit UTF16OutputStream(UTF16String& buffer);
  // Writes to `target`; a null target raises std::invalid_argument.
  explicit UTF16OutputStream(std::unique_ptr<Target> target);
  // The process's terminal: UTF-8 on the C standard output.
  static UTF16OutputStream Terminal();
  // The console log file, one WriteToLog call per line, with the ticks prefix when
  // `addTicks` is true (see ConsoleLogFile).
  static UTF16OutputStream LogFile(bool addTicks);

  UTF16OutputStream(UTF16OutputStream&& other) noexcept;
  UTF16OutputStream& operator=(UTF16OutputStream&& other) noexcept;
  UTF16OutputStream(const UTF16OutputStream&) = delete;
  UTF16OutputStream& operator=(const UTF16OutputStream&) = delete;
  // Flushes; failures of the target are swallowed here.
  ~UTF16OutputStream();

  UTF16OutputStream& Flush();

  UTF16OutputStream& operator<<(UTF16StringView text);
  UTF16OutputStream& operator<<(const UTF16String& text) { return *this << UTF16StringView(text); }
  UTF16OutputStream& operator<<(const UTF16Char* text);
  UTF16OutputStream& operator<<(UTF16Char unit) { return *this << UTF16StringView(&unit, 1); }

  UTF16OutputStream& operator<<(std::string_view utf8);
  UTF16OutputStream& operator<<(const std::string& utf8) { return *this << std::string_view(utf8); }
  UTF16OutputStream& operator<<(const UTF8String& utf8);
  UTF16OutputStream& operator<<(const char* utf8);
  UTF16OutputStream& operator<<(char unit) { return *this << std::string_view(&unit, 1); }

  template <std::integral T>
  requires(!std::is_same_v<T, char> && !std::is_same_v<T, UTF16Char> &&
           !std::is_same_v<T, signed char> && !std::is_same_v<T, unsigned char> &&
           !std::is_same_v<T, char8_t> && !std::is_same_v<T, char32_t> &&
           !std::is_same_v<T, wchar_t>) UTF16OutputStream&
  operator<<(T value) {
    if constexpr (std::is_same_v<T, bool>) {
      return WriteUnsigned(value ? 1 : 0);
    } else if constexpr (std::is_signed_v<T>) {
      return WriteSigned(static_cast<long long>(value));
    } else {
      return WriteUnsigned(static_cast<unsigned long long>(value));
    }
  }
  UTF16OutputStream& operator<<(double value);
  UTF16OutputStream& operator<<(float value) { return *this << static_cast<double>(value); }

  UTF16OutputStream& operator<<(UTF16OutputStream& (*manipulator)(UTF16OutputStream&)) {
    return manipulator(*this);
  }
  // std::endl and std::flush (any other std::ostream manipulator raises
  // std::invalid_argument: it has no meaning here).
  UTF16OutputStream& operator<<(std::ostream& (*manipulator)(std::ostream&));

 private:
  UTF16OutputStream& WriteSigned(long long value);
  UTF16OutputStream& WriteUnsigned(unsigned long long value);

  std::unique_ptr<Target> target_;
};

// Writes a line end ("\n") and flushes.
KELCORE_API UTF16OutputStream& endl(UTF16OutputStream& out);
// Flushes.
KELCORE_API UTF16OutputStream& flush(UTF16OutputStream& out);

}  // namespace kelcore::console
