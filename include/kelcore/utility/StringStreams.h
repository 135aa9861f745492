// Text streams over UTF8String and UTF16String that format and parse numbers the way the
// classic "C" locale does.
//
// The standard library cannot do this for these code units: it has no number facets for
// unsigned char or char16_t streams, so a std::basic_ostringstream<char16_t> fails on the
// first number. These streams keep their text as a UTF8String or UTF16String and hand
// every number to a narrow std::ostream / std::istream imbued with std::locale::classic(),
// so numbers look the same whatever the host did to the global locale: decimal integers
// without grouping, "." as the decimal point, doubles in the default (general) notation
// with precision 6 unless changed.
//
//   oUTF16StringStream out;
//   out << u"x = " << 29.2334 << ", n = " << -7;   // "x = 29.2334, n = -7"
//   iUTF8StringStream in(text);
//   double d; in >> d; if (!in) ...
//
// The interface follows std::basic_stringstream where it can:
// - Format state: flags/setf/unsetf, precision, width, fill; the manipulators of <ios>
//   (std::hex, std::fixed, std::boolalpha, ...), std::endl and std::flush, and the
//   manipulators of <iomanip> (std::setprecision, std::setw, std::setfill with a narrow
//   character, ...). Width applies to the next insertion only; padding uses fill(),
//   placed by the adjustfield flags as the standard streams place it.
// - State: good/eof/fail/bad, rdstate/clear/setstate, operator bool. As with the
//   standard streams, an insertion or extraction does nothing while the state is not
//   good.
// - Insertion appends at the end of the text, also after construction with a text or
//   after str(text) (std::ostringstream would overwrite from the start instead).
// - Extraction reads from its own position, which starts at 0 and moves over what has
//   been read; numbers are parsed by the classic locale's std::num_get, so "12abc" gives
//   12 and leaves "abc", a text that is not a number sets failbit and stores 0, and an
//   out-of-range value stores the largest or smallest value and sets failbit.
//   Whitespace is the classic locale's: space, TAB, LF, VT, FF, CR.
//
// Narrow text inserted into a UTF-8 stream is copied byte for byte (UTF-8 in a
// std::string stays UTF-8). Into a UTF-16 stream each narrow byte becomes the unit of
// the same value, which is right for 7-bit text only. signed char and unsigned char are
// characters, as in the standard streams; inserting a char16_t into a UTF-8 stream does
// not compile.
//
// The streams are plain values: copyable and movable, not thread-safe (one thread per
// object), and they hold no lock or global state. Any type that a narrow std::ostream
// can print (enums, std::complex, ...) can be inserted; it is printed with the classic
// locale.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <cstdint>
#include <ios>
#include <istream>
#include <ostream>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

namespace kelcore::utility {

enum StringStreamMode : unsigned {
  kStringStreamInput = 1,
  kStringStreamOutput = 2,
  kStringStreamInOut = 3,
};

// Machinery shared by every instantiation; not for direct use.
namespace stream_detail {

struct FormatState {
  std::ios_base::fmtflags flags = std::ios_base::skipws | std::ios_base::dec;
  std::streamsize precision = 6;
  std::streamsize width = 0;
  // The narrow stream's fill character: the stream's own when it is 7-bit, else NUL as
  // a stand-in. A narrow manipulator (std::setfill) may change it.
  char fill = ' ';
};

using NarrowWriter = void (*)(std::ostream&, const void*);
using NarrowReader = void (*)(std::istream&, void*);

// Runs `write` on a classic-locale narrow stream carrying `state` and returns what it
// wrote; `state` receives the stream's format state afterwards. The text stays valid
// until the next call on the same thread.
KELCORE_API std::string_view FormatClassic(FormatState& state, NarrowWriter write,
                                           const void* value);

struct ParseOutcome {
  std::size_t consumed;  // characters of `text` that the extraction took
  bool failed;           // the extraction set failbit
  bool reachedEnd;       // the extraction ran into the end of `text`
};

// Runs `read` on a classic-locale narrow stream over `text` carrying `state`.
KELCORE_API ParseOutcome ParseClassic(FormatState& state, std::string_view text, NarrowReader read,
                                      void* target);

template <class T>
constexpr bool kIsCharacterType =
    std::is_same_v<T, char> || std::is_same_v<T, signed char> || std::is_same_v<T, unsigned char> ||
    std::is_same_v<T, wchar_t> || std::is_same_v<T, char8_t> || std::is_same_v<T, char16_t> ||
    std::is_same_v<T, char32_t>;

template <class T>
concept NarrowPrintable = requires(std::ostream& out, const T& value) {
  out << value;
};

// Pointers print as addresses only when they point to void.
template <class T>
constexpr bool kIsNonVoidPointer =
    std::is_pointer_v<T> && !std::is_void_v<std::remove_pointer_t<T>>;

// Values that a narrow stream prints and that no text overload of the stream takes.
template <class T>
concept NarrowFormattable =
    NarrowPrintable<T> && !std::is_array_v<T> && !std::is_function_v<T> && !kIsNonVoidPointer<T> &&
    !std::is_convertible_v<const T&, std::string_view> && !std::is_same_v<T, char>;

template <class T>
concept NarrowParsable = std::is_arithmetic_v<T> && !kIsCharacterType<T>;

inline bool IsClassicSpace(std::uint32_t unit) {
  return unit == ' ' || (unit >= '\t' && unit <= '\r');
}

// Units that can belong to a number in any base or notation the classic locale reads.
inline bool IsNumberUnit(std::uint32_t unit) {
  return (unit >= '0' && unit <= '9') || (unit >= 'a' && unit <= 'z') ||
         (unit >= 'A' && unit <= 'Z') || unit == '+' || unit == '-' || unit == '.';
}

}  // namespace stream_detail

template <class CharT, class Traits, StringStreamMode Mode>
class BasicStringStream {
  static constexpr bool kInput = (Mode & kStringStreamInput) != 0;
  static constexpr bool kOutput = (Mode & kStringStreamOutput) != 0;

 public:
  using char_type = CharT;
  using traits_type = Traits;
  using int_type = typename Traits::int_type;
  using string_type = std::basic_string<CharT, Traits>;
  using view_type = std::basic_string_view<CharT, Traits>;

  BasicStringStream() = default;
  explicit BasicStringStream(string_type text) : text_(std::move(text)) {}

  // The whole text, including what has already been extracted.
  string_type str() const { return text_; }
  // Replaces the text and moves the read position to its start; the state is kept.
  void str(string_type text) {
    text_ = std::move(text);
    readPos_ = 0;
  }

  std::ios_base::fmtflags flags() const { return format_.flags; }
  std::ios_base::fmtflags flags(std::ios_base::fmtflags value) {
    return std::exchange(format_.flags, value);
  }
  std::ios_base::fmtflags setf(std::ios_base::fmtflags value) {
    return std::exchange(format_.flags, format_.flags | value);
  }
  std::ios_base::fmtflags setf(std::ios_base::fmtflags value, std::ios_base::fmtflags mask) {
    return std::exchange(format_.flags, (format_.flags & ~mask) | (value & mask));
  }
  void unsetf(std::ios_base::fmtflags value) { format_.flags &= ~value; }
  std::streamsize precision() const { return format_.precision; }
  std::streamsize precision(std::streamsize value) {
    return std::exchange(format_.precision, value);
  }
  std::streamsize width() const { return format_.width; }
  std::streamsize width(std::streamsize value) { return std::exchange(format_.width, value); }
  CharT fill() const { return fill_; }
  CharT fill(CharT value) { return std::exchange(fill_, value); }

  std::ios_base::iostate rdstate() const { return state_; }
  void clear(std::ios_base::iostate state = std::ios_base::goodbit) { state_ = state; }
  void setstate(std::ios_base::iostate state) { state_ |= state; }
  bool good() const { return state_ == std::ios_base::goodbit; }
  bool eof() const { return (state_ & std::ios_base::eofbit) != 0; }
  bool fail() const { return (state_ & (std::ios_base::failbit | std::ios_base::badbit)) != 0; }
  bool bad() const { return (state_ & std::ios_base::badbit) != 0; }
  explicit operator bool() const { return !fail(); }
  bool operator!() const { return fail(); }

  // ---- Insertion -------------------------------------------------------------------

  BasicStringStream& operator<<(CharT unit) requires kOutput {
    if (good()) AppendPadded(&unit, 1);
    return *this;
  }
  // A null pointer sets badbit.
  BasicStringStream& operator<<(const CharT* text) requires kOutput {
    if (text == nullptr) {
      setstate(std::ios_base::badbit);
    } else if (good()) {
      AppendPadded(text, Traits::length(text));
    }
    return *this;
  }
  BasicStringStream& operator<<(const string_type& text) requires kOutput {
    if (good()) AppendPadded(text.data(), text.size());
    return *this;
  }
  BasicStringStream& operator<<(view_type text) requires kOutput {
    if (good()) AppendPadded(text.data(), text.size());
    return *this;
  }
  BasicStringStream& operator<<(char unit) requires kOutput {
    if (good()) AppendPadded(&unit, 1);
    return *this;
  }
  // A null pointer sets badbit.
  BasicStringStream& operator<<(const char* text) requires kOutput {
    if (text == nullptr) {
      setstate(std::ios_base::badbit);
    } else if (good()) {
      AppendPadded(text, std::char_traits<char>::length(text));
    }
    return *this;
  }
  BasicStringStream& operator<<(const std::string& text) requires kOutput {
    if (good()) AppendPadded(text.data(), text.size());
    return *this;
  }
  BasicStringStream& operator<<(std::string_view text) requires kOutput {
    if (good()) AppendPadded(text.data(), text.size());
    return *this;
  }
  // Numbers, bool, void pointers, <iomanip> manipulators and anything else a narrow
  // stream prints.
  template <stream_detail::NarrowFormattable T>
  BasicStringStream& operator<<(const T& value) requires kOutput {
    if (good()) AppendFormatted(&WriteNarrow<T>, &value);
    return *this;
  }
  BasicStringStream& operator<<(std::ios_base& (*manipulator)(std::ios_base&)) requires kOutput {
    ApplyManipulator(manipulator);
    return *this;
  }
  // std::endl writes a line feed, std::ends a NUL, std::flush nothing.
  BasicStringStream& operator<<(std::ostream& (*manipulator)(std::ostream&)) requires kOutput {
    if (good()) AppendFormatted(&WriteNarrow<decltype(manipulator)>, &manipulator);
    return *this;
  }

  // ---- Extraction ------------------------------------------------------------------

  // Numbers and bool (std::boolalpha reads "true"/"false").
  template <stream_detail::NarrowParsable T>
  BasicStringStream& operator>>(T& value) requires kInput {
    if (!BeginExtraction((format_.flags & std::ios_base::skipws) != 0)) return *this;
    std::string window;
    std::size_t end = readPos_;
    while (end < text_.size() && stream_detail::IsNumberUnit(UnitValue(text_[end]))) {
      window.push_back(static_cast<char>(text_[end]));
      ++end;
    }
    const stream_detail::ParseOutcome outcome =
        stream_detail::ParseClassic(format_, window, &ReadNarrow<T>, &value);
    readPos_ += outcome.consumed;
    if (outcome.failed) setstate(std::ios_base::failbit);
    if (outcome.reachedEnd && end == text_.size()) setstate(std::ios_base::eofbit);
    return *this;
  }
  BasicStringStream& operator>>(CharT& unit) requires kInput {
    if (BeginExtraction((format_.flags & std::ios_base::skipws) != 0)) unit = text_[readPos_++];
    return *this;
  }
  // A word: skips leading whitespace, then reads up to the next whitespace or, when
  // width() > 0, at most width() units.
  BasicStringStream& operator>>(string_type& word) requires kInput {
    const std::streamsize limit = std::exchange(format_.width, 0);
    if (!BeginExtraction((format_.flags & std::ios_base::skipws) != 0)) return *this;
    std::size_t end = readPos_;
    while (end < text_.size() && !stream_detail::IsClassicSpace(UnitValue(text_[end])) &&
           (limit <= 0 || end - readPos_ < static_cast<std::size_t>(limit))) {
      ++end;
    }
    word.assign(text_, readPos_, end - readPos_);
    readPos_ = end;
    if (readPos_ == text_.size()) setstate(std::ios_base::eofbit);
    return *this;
  }
  BasicStringStream& operator>>(std::ios_base& (*manipulator)(std::ios_base&)) requires kInput {
    ApplyManipulator(manipulator);
    return *this;
  }
  // Reads up to `delimiter`, which is taken but not stored. Sets eofbit when the text
  // ends first, failbit when nothing at all was left to read.
  BasicStringStream& getline(string_type& line, CharT delimiter = CharT('\n')) requires kInput {
    line.clear();
    if (!BeginExtraction(false)) return *this;
    const std::size_t found = text_.find(delimiter, readPos_);
    if (found == string_type::npos) {
      line.assign(text_, readPos_);
      readPos_ = text_.size();
      setstate(std::ios_base::eofbit);
    } else {
      line.assign(text_, readPos_, found - readPos_);
      readPos_ = found + 1;
    }
    return *this;
  }
  // The next unit, taken; at the end: eof(), with eofbit and failbit set.
  int_type get() requires kInput {
    if (!BeginExtraction(false)) return Traits::eof();
    return Traits::to_int_type(text_[readPos_++]);
  }
  // The next unit, left in place; at the end: eof(), with eofbit set.
  int_type peek() requires kInput {
    if (!good()) return Traits::eof();
    if (readPos_ == text_.size()) {
      setstate(std::ios_base::eofbit);
      return Traits::eof();
    }
    return Traits::to_int_type(text_[readPos_]);
  }

 private:
  template <class T>
  static void WriteNarrow(std::ostream& out, const void* value) {
    out << *static_cast<const T*>(value);
  }
  template <class T>
  static void ReadNarrow(std::istream& in, void* value) {
    in >> *static_cast<T*>(value);
  }
  static std::uint32_t UnitValue(CharT unit) {
    return static_cast<std::uint32_t>(Traits::to_int_type(unit));
  }
  static CharT Widen(char unit) { return static_cast<CharT>(static_cast<unsigned char>(unit)); }
  static CharT Widen(CharT unit) { return unit; }

  template <class Unit>
  void AppendPadded(const Unit* units, std::size_t count) {
    const std::streamsize width = std::exchange(format_.width, 0);
    const std::size_t padding = width > 0 && static_cast<std::size_t>(width) > count
                                    ? static_cast<std::size_t>(width) - count
                                    : 0;
    const bool left = (format_.flags & std::ios_base::adjustfield) == std::ios_base::left;
    if (!left) text_.append(padding, fill_);
    if constexpr (std::is_same_v<Unit, CharT>) {
      text_.append(units, count);
    } else {
      for (std::size_t i = 0; i < count; ++i) text_.push_back(Widen(units[i]));
    }
    if (left) text_.append(padding, fill_);
  }

  // The narrow stream pads with the stream's fill when that is 7-bit; any other fill
  // goes to it as NUL, and the NULs of the result are turned back into the fill.
  void AppendFormatted(stream_detail::NarrowWriter write, const void* value) {
    const CharT fill = fill_;
    const bool nulStandsForFill = UnitValue(fill) >= 0x80;
    const std::string_view text = FormatNarrow(write, value);
    for (const char unit : text) {
      text_.push_back(nulStandsForFill && unit == '\0' ? fill : Widen(unit));
    }
  }

  std::string_view FormatNarrow(stream_detail::NarrowWriter write, const void* value) {
    const char sentFill = UnitValue(fill_) < 0x80 ? static_cast<char>(fill_) : '\0';
    format_.fill = sentFill;
    const std::string_view text = stream_detail::FormatClassic(format_, write, value);
    if (format_.fill != sentFill) fill_ = Widen(format_.fill);  // std::setfill
    return text;
  }

  void ApplyManipulator(std::ios_base& (*manipulator)(std::ios_base&)) {
    FormatNarrow(&WriteNarrow<decltype(manipulator)>, &manipulator);
  }

  // The standard streams' sentry: fails unless good; optionally skips whitespace; sets
  // eofbit and failbit when no unit is left.
  bool BeginExtraction(bool skipWhitespace) {
    if (!good()) {
      setstate(std::ios_base::failbit);
      return false;
    }
    if (skipWhitespace) {
      while (readPos_ < text_.size() && stream_detail::IsClassicSpace(UnitValue(text_[readPos_]))) {
        ++readPos_;
      }
    }
    if (readPos_ == text_.size()) {
      setstate(std::ios_base::eofbit | std::ios_base::failbit);
      return false;
    }
    return true;
  }

  string_type text_;
  std::size_t readPos_ = 0;
  stream_detail::FormatState format_;
  CharT fill_ = CharT(' ');
  std::ios_base::iostate state_ = std::ios_base::goodbit;
};

using UTF8StringStream = BasicStringStream<unsigned char, UTF8CharTraits, kStringStreamInOut>;
using iUTF8StringStream = BasicStringStream<unsigned char, UTF8CharTraits, kStringStreamInput>;
using oUTF8StringStream = BasicStringStream<unsigned char, UTF8CharTraits, kStringStreamOutput>;

using UTF16StringStream =
    BasicStringStream<UTF16Char, std::char_traits<UTF16Char>, kStringStreamInOut>;
using iUTF16StringStream =
    BasicStringStream<UTF16Char, std::char_traits<UTF16Char>, kStringStreamInput>;
using oUTF16StringStream =
    BasicStringStream<UTF16Char, std::char_traits<UTF16Char>, kStringStreamOutput>;

}  // namespace kelcore::utility
