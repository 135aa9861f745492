// Run-length encoding filters (PackBits).
//
// The encoded form is a plain sequence of packets, with no header, terminator or length.
// Each packet starts with a signed control byte:
//   0 to 127      a literal: the next control + 1 bytes (1 to 128) as they are
//   -1 to -127    a run: the next byte repeated 1 - control times (2 to 128)
//   -128 (0x80)   no operation; the reader skips it, the writer never emits it
//
// The writer's packet choices are fixed, so its output is reproducible byte for byte: a
// run starts when a byte repeats the single pending byte of a fresh packet, or when three
// equal bytes in a row appear inside a literal (the two already pending leave the
// literal). A pair of equal bytes inside a literal stays in the literal. Packets hold at
// most 128 bytes; a lone pending byte is written as a one-byte literal.
//
// Neither filter owns the stream it wraps; it must outlive the filter. Both refuse
// positioning: CurPos raises byte_stream_exception. Errors of the wrapped stream pass
// through unchanged (after one, the filter's state is unspecified).
#pragma once

#include <cstdint>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API ORLEByteStream : public OByteStream {
 public:
  explicit ORLEByteStream(OByteStream& target);
  // Does not flush: a pending packet is lost unless Flush() was called.
  ~ORLEByteStream() override;

  void Put(unsigned char byte) override;
  // The same packets as one Put per byte.
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;

  // Writes the pending packet, if any, to the target.
  virtual void Flush();

 protected:
  // Writes the pending bytes as one packet (control byte with the target's Put, data with
  // one WriteBlock) and empties them; does nothing when nothing is pending.
  virtual void WritePacket();

 private:
  static constexpr std::uint32_t kMaxPacket = 128;

  void Append(unsigned char byte);

  OByteStream& target_;
  bool run_ = true;
  std::uint32_t count_ = 0;
  unsigned char pending_[kMaxPacket] = {};
};

class KELCORE_API IRLEByteStream : public IByteStream {
 public:
  explicit IRLEByteStream(IByteStream& source);
  ~IRLEByteStream() override;

  // The next decoded byte. The end of the encoded data is the end of the source: this
  // raises whatever the source raises there (eof_error for the memory streams).
  unsigned char Get() override;
  // The same bytes as one Get per byte; literals are read from the source in blocks.
  void ReadBlock(unsigned char* dst, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // 0: the decoded length is not known.
  unsigned long long Length() const override;

 private:
  void ReadControl();

  IByteStream& source_;
  std::int32_t literal_ = 0;
  std::int32_t repeat_ = 0;
  unsigned char repeated_ = 0;
};

}  // namespace kelcore::filesupport
