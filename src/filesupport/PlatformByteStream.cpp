#include <kelcore/filesupport/PlatformByteStream.h>

#include <stdexcept>

#include <kelcore/filesupport/ByteStreamExceptions.h>
#include <kelcore/filesupport/FileExceptions.h>

#include "filesupport/PathEncoding.h"
#include "filesupport/SystemError.h"

// The handle operations, in this file's anonymous namespace: kNoHandle, StreamSharing,
// OpenResult, OpenFileHandle, TakeShareLocks, ReadHandle, WriteHandle, SeekHandle,
// HandlePosition, HandleSize, SyncHandle, TruncateHandle and CloseHandle.
#if defined(_WIN32)
#include "win/PlatformByteStream.inc"
#else
#include "posix/PlatformByteStream.inc"
#endif

namespace kelcore::filesupport {

struct IPlatformByteStream::Record {
  File file;
  int handle = kNoHandle;
  bool ownsHandle = false;
};

struct OPlatformByteStream::Record {
  File file;
  int handle = kNoHandle;
  utility::Flags<unsigned long> options;
  bool applySharing = false;
};

namespace {

StreamSharing SharingOf(bool output, utility::Flags<unsigned long> options) {
  return StreamSharing{output, options.Test(kPlatformStreamSharing)};
}

int OpenForStream(const File& file, StreamSharing sharing) {
  const std::string nativePath = detail::EncodePath(file.Helper().FullNativePath());
  if (detail::ContainsNul(nativePath)) throw file_not_found_exception(file);
  const OpenResult opened = OpenFileHandle(nativePath, sharing);
  if (opened.handle != kNoHandle) return opened.handle;
  if (opened.errorCode == detail::kErrorFileNotFound ||
      opened.errorCode == detail::kErrorPathNotFound) {
    throw file_not_found_exception(file);
  }
  throw io_error();
}

}  // namespace

IPlatformByteStream::IPlatformByteStream(const File& file, utility::Flags<unsigned long> options)
    : record_(std::make_unique<Record>(Record{file})) {
  record_->handle = OpenForStream(file, SharingOf(false, options));
  record_->ownsHandle = true;
}

IPlatformByteStream::IPlatformByteStream(OPlatformByteStream* writer)
    : record_(std::make_unique<Record>()) {
  if (writer == nullptr) throw std::invalid_argument("IPlatformByteStream: no writer");
  record_->handle = writer->GetPlatformHandle();
}

IPlatformByteStream::~IPlatformByteStream() {
  if (record_->ownsHandle) CloseHandle(record_->handle);
}

unsigned char IPlatformByteStream::Get() {
  unsigned char byte = 0;
  ReadHandle(record_->handle, &byte, 1);
  return byte;
}

void IPlatformByteStream::ReadBlock(unsigned char* dst, unsigned long count) {
  ReadHandle(record_->handle, dst, count);
}

void IPlatformByteStream::CurPos(unsigned long long pos) {
  SeekHandle(record_->handle, pos);
}

unsigned long long IPlatformByteStream::CurPos() const {
  return HandlePosition(record_->handle);
}

unsigned long long IPlatformByteStream::Length() const {
  return HandleSize(record_->handle);
}

int IPlatformByteStream::GetPlatformHandle() const {
  return record_->handle;
}

OPlatformByteStream::OPlatformByteStream(const File& file, utility::Flags<unsigned long> options)
    : record_(std::make_unique<Record>(Record{file, kNoHandle, options, false})) {
  record_->handle = OpenForStream(file, SharingOf(true, options));
}

OPlatformByteStream::OPlatformByteStream(bool applySharing, const File& file,
                                         utility::Flags<unsigned long> options)
    : record_(std::make_unique<Record>(Record{file, kNoHandle, options, applySharing})) {}

OPlatformByteStream::~OPlatformByteStream() {
  if (record_->handle != kNoHandle) CloseHandle(record_->handle);
}

void OPlatformByteStream::SetPlatformHandle(int handle) {
  if (record_->applySharing && handle != kNoHandle &&
      !TakeShareLocks(handle, SharingOf(true, record_->options))) {
    throw io_error();
  }
  if (record_->handle != kNoHandle && record_->handle != handle) CloseHandle(record_->handle);
  record_->handle = handle;
}

void OPlatformByteStream::Put(unsigned char byte) {
  WriteHandle(record_->handle, &byte, 1);
}

void OPlatformByteStream::WriteBlock(const unsigned char* src, unsigned long count) {
  WriteHandle(record_->handle, src, count);
}

void OPlatformByteStream::CurPos(unsigned long long pos) {
  SeekHandle(record_->handle, pos);
}

unsigned long long OPlatformByteStream::CurPos() const {
  return HandlePosition(record_->handle);
}

void OPlatformByteStream::OSFlush() {
  SyncHandle(record_->handle);
}

void OPlatformByteStream::Truncate(unsigned long long length) {
  if (length > Length()) throw eof_error();
  CurPos(length);
  TruncateHandle(record_->handle, length);
}

unsigned long long OPlatformByteStream::Length() const {
  return HandleSize(record_->handle);
}

int OPlatformByteStream::GetPlatformHandle() const {
  return record_->handle;
}

}  // namespace kelcore::filesupport
