#include <kelcore/debug/DebugStreamBuffers.h>

#include <kelcore/debug/Trace.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <cstdio>

namespace kelcore::debug {

namespace {

using Traits = std::char_traits<UTF16Char>;

void PassToDebugger(const UTF16String& piece) {
  DebugTrace(utility::UTF16to8(piece).c_str());
}

void PutLine(const UTF16String& line) {
  std::puts(reinterpret_cast<const char*>(utility::UTF16to8(line).c_str()));
}

}  // namespace

DebugStreamBuffer<UTF16Char>::~DebugStreamBuffer() {
  sync();
}

DebugStreamBuffer<UTF16Char>::int_type DebugStreamBuffer<UTF16Char>::overflow(int_type ch) {
  if (Traits::eq_int_type(ch, Traits::eof())) return Traits::not_eof(ch);
  pending_.push_back(Traits::to_char_type(ch));
  if (pending_.back() == u'\n') sync();
  return ch;
}

int DebugStreamBuffer<UTF16Char>::sync() {
  if (!pending_.empty()) {
    PassToDebugger(pending_);
    pending_.clear();
  }
  return 0;
}

UTF16StdOutStreamBuffer<UTF16Char>::~UTF16StdOutStreamBuffer() {
  sync();
}

UTF16StdOutStreamBuffer<UTF16Char>::int_type UTF16StdOutStreamBuffer<UTF16Char>::overflow(
    int_type ch) {
  if (Traits::eq_int_type(ch, Traits::eof())) return Traits::not_eof(ch);
  const UTF16Char unit = Traits::to_char_type(ch);
  if (unit == u'\n') {
    PutLine(pending_);
    pending_.clear();
  } else {
    pending_.push_back(unit);
  }
  return ch;
}

int UTF16StdOutStreamBuffer<UTF16Char>::sync() {
  if (!pending_.empty()) {
    PutLine(pending_);
    pending_.clear();
  }
  std::fflush(stdout);
  return 0;
}

}  // namespace kelcore::debug
