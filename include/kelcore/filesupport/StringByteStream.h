// Byte streams over a narrow std::string that the caller owns and that must outlive the
// stream. The characters are taken and stored as raw bytes.
//
// The input reads from a position that may be set anywhere without a check (eof_error
// at the next Get when it is at or past the end of the string). The output only ever
// appends: setting its position is ignored and its position is always the string's size;
// Truncate resizes the string.
#pragma once

#include <string>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>

namespace kelcore::filesupport {

class KELCORE_API IStringByteStream : public IByteStream {
 public:
  explicit IStringByteStream(std::string& text);
  ~IStringByteStream() override;

  unsigned char Get() override;
  void ReadBlock(unsigned char* dst, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // The string's current size.
  unsigned long long Length() const override;

 private:
  std::string& text_;
  unsigned long long position_ = 0;
};

class KELCORE_API OStringByteStream : public OByteStream {
 public:
  explicit OStringByteStream(std::string& text);
  ~OStringByteStream() override;

  // Appends at the end, always.
  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  // Ignored: the output is append-only.
  void CurPos(unsigned long long pos) override;
  // The string's size.
  unsigned long long CurPos() const override;
  // Does nothing: there is no operating-system destination.
  void OSFlush() override;
  // Pads the string with zero bytes up to `length`, or cuts it to `length`. A length
  // beyond the string's max_size() raises std::length_error ("string too long").
  void Truncate(unsigned long long length) override;

 private:
  std::string& text_;
};

}  // namespace kelcore::filesupport
