// SafeTraceStream: a trace stream that never allocates, for places where neither the
// heap nor the trace manager's lock may be touched (allocators, signal-like contexts,
// low-memory paths).
//
// Text is collected as UTF-16 in a fixed buffer of 512 code units inside the object.
// Whenever 511 units are collected they are NUL-terminated and written out as one
// piece, and the buffer starts again; the destructor (or Flush) writes what is left, if
// anything. A piece may end between the two halves of a surrogate pair.
//
// Inserted values:
//   - int, long: printf "%ld"; unsigned int, unsigned long: "%lu"; long long: "%lld";
//     unsigned long long: "%llu"; double: "%lg" (the classic "C" locale formats);
//   - char const*: widened byte by byte, each byte one code unit of the same value (no
//     UTF-8 decoding: 7-bit text comes out as written, other bytes as Latin-1);
//   - UTF16Char const*: copied unit by unit;
//   - a null pointer inserts nothing.
//
// Pieces go to the debugger's output by default: when a debugger is attached, the
// piece as UTF-8 (unpaired surrogates encoded on their own, as elsewhere in the library)
// is written to standard error; otherwise nothing. A caller may direct them elsewhere
// with its own writer, which receives the NUL-terminated piece and its length, must not
// throw, and must not rely on the heap if the stream is used where the heap is off
// limits.
//
// Threads: one object belongs to one caller; objects share nothing and take no lock.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

#include <cstddef>
#include <cstdint>

namespace kelcore::debug {

class KELCORE_API SafeTraceStream {
 public:
  static constexpr std::uint32_t kBufferUnits = 512;
  static constexpr std::uint32_t kPieceUnits = kBufferUnits - 1;

  using PieceWriter = void (*)(const UTF16Char* piece, std::uint32_t length, void* context);

  // Pieces go to the debugger's output.
  SafeTraceStream() noexcept;
  // Pieces go to `writer(piece, length, context)`; a null writer discards them.
  SafeTraceStream(PieceWriter writer, void* context) noexcept;
  // Writes what is left.
  ~SafeTraceStream();
  SafeTraceStream(const SafeTraceStream&) = delete;
  SafeTraceStream& operator=(const SafeTraceStream&) = delete;

  // Appends `length` code units.
  void Append(const UTF16Char* text, std::size_t length) noexcept;
  // Appends `length` bytes, each widened to one code unit.
  void AppendBytes(const char* bytes, std::size_t length) noexcept;
  // Writes what is collected as a piece now, if anything.
  void Flush() noexcept;
  // The number of units collected and not yet written.
  std::uint32_t Count() const noexcept { return count_; }

 private:
  void WritePiece() noexcept;

  UTF16Char buffer_[kBufferUnits];
  std::uint32_t count_ = 0;
  PieceWriter writer_;
  void* context_;
};

KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, int value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned int value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, long value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned long value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, long long value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, unsigned long long value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, double value) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, const char* text) noexcept;
KELCORE_API SafeTraceStream& operator<<(SafeTraceStream& stream, const UTF16Char* text) noexcept;

}  // namespace kelcore::debug
