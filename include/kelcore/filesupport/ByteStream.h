// The byte stream base classes.
//
// An input stream hands out one byte at a time (IByteStream::Get), an output stream takes
// one byte at a time (OByteStream::Put); block transfer, the typed big-endian operators
// (<kelcore/filesupport/ByteStreamOperators.h>) and the stream-to-stream copy are built
// on those two calls. Concrete streams derive from IByteStream or OByteStream.
//
// ByteStream_base carries per-stream extension storage in the manner of std::ios_base:
// integer words, pointer words and callbacks that run when the stream is destroyed.
//
// Streams are single-threaded objects with no locking; one thread at a time may use a
// stream. xalloc may be called from any thread (the counter is atomic), but indices are
// usually taken once at start-up. Streams are neither copyable nor movable.
//
// Destructors may throw: a stream that writes buffered data when it is destroyed lets an
// error of its destination pass to the caller. (Such an error raised while the stack is
// already being unwound for another exception ends the program, as always in C++.)
//
// Get and put areas. A stream whose next bytes sit in memory may expose them as a window
// [gptr_, egptr_) of bytes that the next Gets would return, or [pptr_, epptr_) of slots
// that the next Puts would fill, in the manner of std::streambuf. The typed operators
// take bytes from, or store bytes into, such a window directly and advance the pointer,
// and fall back to the virtual Get/Put for every byte that is not in the window. A stream
// that exposes a window promises that this has exactly the effect of the same number of
// Get (Put) calls; it accounts for the bytes moved through the window, by comparing the
// pointer with where it put it, before any of its virtual operations does anything else.
// Streams that do not expose a window (all pointers null) see one Get/Put per byte.
// TakeFromGetArea and TakeFromPutArea hand the window to code outside the stream (the
// inline typed operators, or a caller's own fixed-width fields) under the same promise:
// taking n bytes has the effect of n Gets (Puts).
#pragma once

#include <cstddef>
#include <cstdint>
#include <utility>
#include <vector>

#include <kelcore/Export.h>

namespace kelcore::filesupport {

namespace detail {
class StreamAreas;
}

class KELCORE_API ByteStream_base {
 public:
  // Events passed to callbacks. The library raises only kEraseEvent (value 0), once, from
  // the destructor.
  enum event { kEraseEvent = 0 };
  using event_callback = void (*)(event, ByteStream_base&, int);

  ByteStream_base(const ByteStream_base&) = delete;
  ByteStream_base& operator=(const ByteStream_base&) = delete;

  // Calls every registered callback, first registered first, as fn(kEraseEvent, *this,
  // index). Callbacks must not throw (a throwing callback ends the program).
  virtual ~ByteStream_base() noexcept(false);

  // A process-wide index usable with iword/pword of any stream: 0 on the first call, then
  // 1, 2, ...
  static int xalloc();

  // The integer (pointer) word at `index`. The array grows to index + 1 elements when
  // needed, new elements zero (null). The reference stays valid until a later call grows
  // the array. A negative index raises std::out_of_range.
  long& iword(int index);
  void*& pword(int index);

  // Appends (fn, index) to the callbacks; no duplicate check.
  void register_callback(event_callback fn, int index);

 protected:
  ByteStream_base() = default;

 private:
  std::vector<long> iwords_;
  std::vector<void*> pwords_;
  std::vector<std::pair<event_callback, int>> callbacks_;
};

// Base of every input stream. Positions and lengths are byte counts from the start.
class KELCORE_API IByteStream : public ByteStream_base {
 public:
  IByteStream() = default;
  ~IByteStream() override;

  // The next byte; the position moves on by one. Streams with a known end raise
  // eof_error when no byte is left.
  virtual unsigned char Get() = 0;
  // `count` bytes into dst, as `count` calls of Get (a stream may do it faster with the
  // same result). If Get raises part way, the bytes before it have been stored.
  virtual void ReadBlock(unsigned char* dst, unsigned long count);
  virtual void CurPos(unsigned long long pos) = 0;
  virtual unsigned long long CurPos() const = 0;
  // CurPos() == Length().
  virtual bool AtTheEnd() const;
  // The length in bytes; 0 means that the length is not known.
  virtual unsigned long long Length() const;

  // The next `count` bytes (count >= 1) when the get area holds them all: they are consumed
  // as `count` Gets would consume them, and stay valid until the next call on the stream.
  // Null, with nothing consumed, when the area holds fewer (or the stream exposes none);
  // the caller then reads them with Get.
  const unsigned char* TakeFromGetArea(std::size_t count) noexcept {
    if (static_cast<std::size_t>(egptr_ - gptr_) < count) return nullptr;
    const unsigned char* const bytes = gptr_;
    gptr_ += count;
    return bytes;
  }

 protected:
  // The get area (see the top of this file); both null when the stream exposes none.
  const unsigned char* gptr_ = nullptr;
  const unsigned char* egptr_ = nullptr;

 private:
  friend class detail::StreamAreas;
};

// Base of every output stream.
class KELCORE_API OByteStream : public ByteStream_base {
 public:
  OByteStream() = default;
  ~OByteStream() override;

  // Appends or overwrites one byte at the current position; the position moves on by one.
  virtual void Put(unsigned char byte) = 0;
  // `count` bytes from src, as `count` calls of Put (a stream may do it faster with the
  // same result).
  virtual void WriteBlock(const unsigned char* src, unsigned long count);
  virtual void CurPos(unsigned long long pos) = 0;
  virtual unsigned long long CurPos() const = 0;
  // Pushes everything written so far down to the operating system, and cuts the
  // destination to `length` bytes. Only streams with an operating-system or resizable
  // destination implement these; on the others a call is a program fault: it is reported
  // on standard error and the process is aborted.
  virtual void OSFlush();
  virtual void Truncate(unsigned long long length);

  // The next `count` slots (count >= 1) when the put area holds them all: they count as
  // written by `count` Puts, so the caller must fill every one of them before its next
  // call on the stream. Null, with nothing taken, when the area holds fewer (or the stream
  // exposes none); the caller then writes the bytes with Put.
  unsigned char* TakeFromPutArea(std::size_t count) noexcept {
    if (static_cast<std::size_t>(epptr_ - pptr_) < count) return nullptr;
    unsigned char* const slots = pptr_;
    pptr_ += count;
    return slots;
  }

 protected:
  // The put area (see the top of this file); both null when the stream exposes none.
  unsigned char* pptr_ = nullptr;
  unsigned char* epptr_ = nullptr;

 private:
  friend class detail::StreamAreas;
};

}  // namespace kelcore::filesupport
