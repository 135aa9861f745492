#include <kelcore/xml/ReservedCharacters.h>

#include <cstddef>

#include <kelcore/utility/UnicodeConversion.h>

namespace kelcore::xml::utils {
namespace {

void AppendAscii(UTF8String& out, const char* text) {
  out.append(utility::AsciiToUTF8Impl(text));
}

void EscapeInto(const UTF8String& in, UTF8String& out) {
  out.reserve(out.size() + in.size());
  for (const unsigned char byte : in) {
    switch (byte) {
      case '"':
        AppendAscii(out, "&quot;");
        break;
      case '&':
        AppendAscii(out, "&amp;");
        break;
      case '\'':
        AppendAscii(out, "&apos;");
        break;
      case '<':
        AppendAscii(out, "&lt;");
        break;
      case '>':
        AppendAscii(out, "&gt;");
        break;
      default:
        out.push_back(byte);
        break;
    }
  }
}

// Compares the scratch with a 7-bit name of the same length.
template <class Unit>
bool ScratchIs(const Unit* scratch, std::size_t length, const char* name) {
  for (std::size_t i = 0; i < length; ++i) {
    if (name[i] == '\0' || scratch[i] != static_cast<Unit>(name[i])) return false;
  }
  return name[length] == '\0';
}

// The unescaping scanner: copying, inside a reference, or expecting its semicolon. The
// scratch holds at most the four name units of the longest reference.
template <class String>
String Unescape(const String& in) {
  using Unit = typename String::value_type;
  enum class State { kCopying, kInEntity, kExpectingSemicolon };
  State state = State::kCopying;
  Unit scratch[4] = {};
  std::size_t scratchLength = 0;
  Unit decoded = 0;
  String out;
  out.reserve(in.size());

  const auto flush = [&] {
    out.push_back(static_cast<Unit>('&'));
    out.append(scratch, scratchLength);
    scratchLength = 0;
  };

  for (const Unit unit : in) {
    switch (state) {
      case State::kCopying:
        if (unit == static_cast<Unit>('&')) {
          state = State::kInEntity;
        } else {
          out.push_back(unit);
        }
        break;
      case State::kInEntity:
        if (unit == static_cast<Unit>('&')) {
          flush();
          break;
        }
        scratch[scratchLength++] = unit;
        if (scratchLength == 2 && ScratchIs(scratch, 2, "lt")) {
          decoded = '<';
        } else if (scratchLength == 2 && ScratchIs(scratch, 2, "gt")) {
          decoded = '>';
        } else if (scratchLength == 3 && ScratchIs(scratch, 3, "amp")) {
          decoded = '&';
        } else if (scratchLength == 4 && ScratchIs(scratch, 4, "apos")) {
          decoded = '\'';
        } else if (scratchLength == 4 && ScratchIs(scratch, 4, "quot")) {
          decoded = '"';
        } else {
          if (scratchLength == 4) {
            flush();
            state = State::kCopying;
          }
          break;
        }
        state = State::kExpectingSemicolon;
        break;
      case State::kExpectingSemicolon:
        if (unit == static_cast<Unit>(';')) {
          out.push_back(decoded);
          scratchLength = 0;
          state = State::kCopying;
        } else if (unit == static_cast<Unit>('&')) {
          flush();
          state = State::kInEntity;
        } else {
          flush();
          out.push_back(unit);
          state = State::kCopying;
        }
        break;
    }
  }
  if (state != State::kCopying) flush();
  return out;
}

}  // namespace

void EncodeReservedCharacters(const UTF8String& in, UTF8String& out) {
  if (&in == &out) {
    const UTF8String copy = in;
    EscapeInto(copy, out);
  } else {
    EscapeInto(in, out);
  }
}

void EncodeReservedCharacters(const UTF16String& in, UTF16String& out) {
  UTF8String escaped;
  EscapeInto(utility::UTF16to8(in), escaped);
  out = utility::UTF8to16(escaped);
}

void DecodeReservedCharacters(const UTF8String& in, UTF8String& out) {
  out = Unescape(in);
}

void DecodeReservedCharacters(const UTF16String& in, UTF16String& out) {
  out = Unescape(in);
}

}  // namespace kelcore::xml::utils
