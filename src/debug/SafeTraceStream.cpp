#include <kelcore/debug/SafeTraceStream.h>

#include "debug/DebugOutput.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <string_view>

namespace kelcore::debug {

namespace {

// Encodes a piece as UTF-8 on the stack (no heap) and writes it while a debugger is
// attached. Pairs become four bytes; every other unit, a lone surrogate included, the
// UTF-8 form of its own value.
void WritePieceToDebugger(const UTF16Char* piece, std::uint32_t length, void*) {
  if (!IsDebuggerAttached()) return;
  char bytes[SafeTraceStream::kPieceUnits * 3];
  std::size_t used = 0;
  for (std::uint32_t i = 0; i < length; ++i) {
    std::uint32_t unit = piece[i];
    if (unit >= 0xD800 && unit < 0xDC00 && i + 1 < length && piece[i + 1] >= 0xDC00 &&
        piece[i + 1] < 0xE000) {
      unit = 0x10000 + ((unit - 0xD800) << 10) + (piece[i + 1] - 0xDC00u);
      ++i;
    }
    if (unit < 0x80) {
      bytes[used++] = static_cast<char>(unit);
    } else if (unit < 0x800) {
      bytes[used++] = static_cast<char>(0xC0 | (unit >> 6));
      bytes[used++] = static_cast<char>(0x80 | (unit & 0x3F));
    } else if (unit < 0x10000) {
      bytes[used++] = static_cast<char>(0xE0 | (unit >> 12));
      bytes[used++] = static_cast<char>(0x80 | ((unit >> 6) & 0x3F));
      bytes[used++] = static_cast<char>(0x80 | (unit & 0x3F));
    } else {
      bytes[used++] = static_cast<char>(0xF0 | (unit >> 18));
      bytes[used++] = static_cast<char>(0x80 | ((unit >> 12) & 0x3F));
      bytes[used++] = static_cast<char>(0x80 | ((unit >> 6) & 0x3F));
      bytes[used++] = static_cast<char>(0x80 | (unit & 0x3F));
    }
  }
  DebugOutput(std::string_view(bytes, used));
}

template <class... Args>
SafeTraceStream& AppendFormatted(SafeTraceStream& stream, const char* format,
                                 Args... args) noexcept {
  char text[64];
  const int length = std::snprintf(text, sizeof(text), format, args...);
  if (length > 0) {
    stream.AppendBytes(text, std::min(static_cast<std::size_t>(length), sizeof(text) - 1));
  }
  return stream;
}

}  // namespace

SafeTraceStream::SafeTraceStream() noexcept : SafeTraceStream(&WritePieceToDebugger, nullptr) {}

SafeTraceStream::SafeTraceStream(PieceWriter writer, void* context) noexcept
    : writer_(writer), context_(context) {}

SafeTraceStream::~SafeTraceStream() {
  Flush();
}

void SafeTraceStream::Append(const UTF16Char* text, std::size_t length) noexcept {
  while (length > 0) {
    const std::size_t take = std::min<std::size_t>(length, kPieceUnits - count_);
    std::memcpy(buffer_ + count_, text, take * sizeof(UTF16Char));
    count_ += static_cast<std::uint32_t>(take);
    text += take;
    length -= take;
    if (count_ == kPieceUnits) WritePiece();
  }
}

void SafeTraceStream::AppendBytes(const char* bytes, std::size_t length) noexcept {
  for (std::size_t i = 0; i < length; ++i) {
    buffer_[count_++] = static_cast<UTF16Char>(static_cast<unsigned char>(bytes[i]));
    if (count_ == kPieceUnits) WritePiece();
  }
}

void SafeTraceStream::Flush() noexcept {
  if (count_ > 0) WritePiece();
}

void SafeTraceStream::WritePiece() noexcept {
  buffer_[count_] = 0;
  if (writer_ != nullptr) writer_(buffer_, count_, context_);
  count_ = 0;
}

SafeTraceStream& operator<<(SafeTraceStream& stream, int value) noexcept {
  return AppendFormatted(stream, "%ld", static_cast<long>(value));
}

SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned int value) noexcept {
  return AppendFormatted(stream, "%lu", static_cast<unsigned long>(value));
}

SafeTraceStream& operator<<(SafeTraceStream& stream, long value) noexcept {
  return AppendFormatted(stream, "%ld", value);
}

SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned long value) noexcept {
  return AppendFormatted(stream, "%lu", value);
}

SafeTraceStream& operator<<(SafeTraceStream& stream, long long value) noexcept {
  return AppendFormatted(stream, "%lld", value);
}

SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned long long value) noexcept {
  return AppendFormatted(stream, "%llu", value);
}

SafeTraceStream& operator<<(SafeTraceStream& stream, double value) noexcept {
  return AppendFormatted(stream, "%lg", value);
}

SafeTraceStream& operator<<(SafeTraceStream& stream, const char* text) noexcept {
  if (text != nullptr) stream.AppendBytes(text, std::strlen(text));
  return stream;
}

SafeTraceStream& operator<<(SafeTraceStream& stream, const UTF16Char* text) noexcept {
  if (text == nullptr) return stream;
  std::size_t length = 0;
  while (text[length] != 0) ++length;
  stream.Append(text, length);
  return stream;
}

}  // namespace kelcore::debug
