// Stream buffers that let UTF-16 std::basic_ostream objects print to the debugger or to
// standard output:
//
//   kelcore::debug::DebugStreamBuffer<kelcore::UTF16Char> buffer;
//   std::basic_ostream<kelcore::UTF16Char> out(&buffer);
//   out << u"Opened " << name << u'\n';
//
// Both collect characters until a piece is complete, convert it from UTF-16 to UTF-8
// (unpaired surrogates are kept, encoded on their own) and hand it on:
//   - DebugStreamBuffer passes each piece to DebugTrace (so it shows only while a
//     debugger is attached). A piece ends after each LF, which it keeps, and at each
//     sync (std::flush, std::endl, destruction) with what is collected.
//   - UTF16StdOutStreamBuffer writes each piece to standard output followed by a newline
//     (puts). A piece is a line without its LF, or, at a sync, what is collected of an
//     unfinished line (which therefore ends the line on the console).
// Where UTF16Char is char16_t (everywhere but Windows), the standard library has no
// numeric facets for it: such streams insert characters and strings, not numbers.
//
// Threads: a buffer belongs to one stream and is not synchronised; use one per thread.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <streambuf>

namespace kelcore::debug {

// Only the UTF16Char forms exist.
template <class CharT>
class DebugStreamBuffer;
template <class CharT>
class UTF16StdOutStreamBuffer;

template <>
class KELCORE_API DebugStreamBuffer<UTF16Char> : public std::basic_streambuf<UTF16Char> {
 public:
  DebugStreamBuffer() = default;
  ~DebugStreamBuffer() override;

 protected:
  int_type overflow(int_type ch) override;
  int sync() override;

 private:
  UTF16String pending_;
};

template <>
class KELCORE_API UTF16StdOutStreamBuffer<UTF16Char> : public std::basic_streambuf<UTF16Char> {
 public:
  UTF16StdOutStreamBuffer() = default;
  ~UTF16StdOutStreamBuffer() override;

 protected:
  int_type overflow(int_type ch) override;
  int sync() override;

 private:
  UTF16String pending_;
};

}  // namespace kelcore::debug
