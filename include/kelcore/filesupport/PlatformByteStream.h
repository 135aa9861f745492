// Byte streams on an open file: one system call per Get, Put or block. Put a buffered
// stream (<kelcore/filesupport/BufferedByteStream.h>) in front for byte-wise traffic.
//
// Opening. Both streams open an existing file only; the output never creates one (make
// it first with File::Create). A missing file or directory on the path raises
// file_not_found_exception holding the File; any other failure (no permission, a
// directory, a sharing violation, ...) raises io_error. Handles are not inherited by
// child processes.
//
// Sharing. Of the option bits only kPlatformStreamSharing (2) is read:
//
//   stream   access        without the bit         with the bit
//   input    read          others may only read    others may read and write
//   output   read, write   others may not open     others may only read
//
// An open raises io_error when an open stream's rules forbid its access, or when its own
// rules forbid the access of a stream already open. So the only streams that may be open
// on one file together are inputs (with or without the bit), and inputs with the bit
// beside one output with the bit. On POSIX the rules are kept with open-file-description
// locks (fcntl F_OFD_SETLK) on two bytes at the top of the offset range, which no data
// reaches: byte 2^63 - 3 ("open") and byte 2^63 - 2 ("written"):
//
//   input without the bit    shared lock on "open" and on "written"
//   input with the bit       shared lock on "open"
//   output without the bit   exclusive lock on "open"
//   output with the bit      shared lock on "open", exclusive lock on "written"
//
// These locks conflict between different opens of the file, in one process as in
// several, so every stream of this library on the machine keeps the rules; programs that
// take no such locks are not held back. The locks go when the stream closes its handle.
// Where the file system keeps no locks (fcntl fails with anything but a conflict), the
// file opens without the sharing rules.
//
// Reading. Get and ReadBlock raise io_error when the system refuses the read. Reaching
// the ordinary end of the file is not an error: Get there returns an unspecified byte
// (0 on POSIX) and ReadBlock leaves the bytes beyond the end as they were, both without
// raising and without moving the position past the end. Test the end with AtTheEnd() or
// Length(). ReadBlock reads until `count` bytes or the end.
//
// Writing. Put and WriteBlock write at the position (overwriting, or extending the file
// past its end) and raise io_error when the system refuses (a full disk, ...). Bytes of
// an existing file beyond the written range stay until Truncate.
//
// Positions and lengths are 64-bit: CurPos(pos) sets the file position (io_error when the
// system refuses it, e.g. pos above 2^63 - 1), Length() is the file's current size.
//
// Not thread-safe: one thread at a time per stream. An input made on an output uses the
// output's handle and so its file position: reads and writes through the two move one
// common position.
#pragma once

#include <memory>

#include <kelcore/Export.h>
#include <kelcore/filesupport/ByteStream.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/utility/Flags.h>

namespace kelcore::filesupport {

// The option bit that widens what other streams may do with the file (see above).
inline constexpr unsigned long kPlatformStreamSharing = 2;

class OPlatformByteStream;

class KELCORE_API IPlatformByteStream : public IByteStream {
 public:
  // Opens `file` for reading; the stream owns the handle.
  IPlatformByteStream(const File& file, utility::Flags<unsigned long> options);
  // Reads through the writer's handle, which stays the writer's: the writer must outlive
  // this stream. The stream holds an empty File. A null writer raises
  // std::invalid_argument.
  explicit IPlatformByteStream(OPlatformByteStream* writer);
  // Closes the handle when the stream owns it; a failing close is ignored.
  ~IPlatformByteStream() override;

  unsigned char Get() override;
  void ReadBlock(unsigned char* dst, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  unsigned long long Length() const override;

  // The system handle (a file descriptor on POSIX).
  virtual int GetPlatformHandle() const;

 private:
  struct Record;
  std::unique_ptr<Record> record_;
};

class KELCORE_API OPlatformByteStream : public OByteStream {
 public:
  // Opens the existing `file` for reading and writing; the stream owns the handle.
  OPlatformByteStream(const File& file, utility::Flags<unsigned long> options);
  // Closes a valid handle; a failing close is ignored.
  ~OPlatformByteStream() override;

  void Put(unsigned char byte) override;
  void WriteBlock(const unsigned char* src, unsigned long count) override;
  void CurPos(unsigned long long pos) override;
  unsigned long long CurPos() const override;
  // Pushes the written data to the storage device (fdatasync on POSIX: the data and what
  // is needed to read it back, such as the size, but not the time stamps).
  void OSFlush() override;
  // Cuts the file to `length` bytes and leaves the position there. A length above the
  // current size raises eof_error and changes nothing: the file is never extended.
  void Truncate(unsigned long long length) override;

  virtual unsigned long long Length() const;
  virtual int GetPlatformHandle() const;

 protected:
  // Opens nothing: the handle is invalid (every operation raises io_error) until
  // SetPlatformHandle. With `applySharing` SetPlatformHandle keeps the sharing rules of
  // `options` for the handle it is given, as if the stream had opened the file itself.
  OPlatformByteStream(bool applySharing, const File& file, utility::Flags<unsigned long> options);
  // The stream takes `handle` over (closing the one it held) and closes it at
  // destruction. When the sharing rules apply and another stream's open forbids them,
  // raises io_error and leaves both handles as they were, `handle` still the caller's.
  void SetPlatformHandle(int handle);

 private:
  struct Record;
  std::unique_ptr<Record> record_;
};

}  // namespace kelcore::filesupport
