// A document file opened read-only by path and read front to back in pieces. Closed when
// destroyed. One thread at a time.
#pragma once

#include <cstddef>

#include <kelcore/utility/StringTypes.h>

namespace kelcore::xml {

class DocumentFile {
 public:
  DocumentFile() = default;
  ~DocumentFile();
  DocumentFile(const DocumentFile&) = delete;
  DocumentFile& operator=(const DocumentFile&) = delete;

  // Opens the file at `path`; false when it cannot be opened for reading or is a
  // directory. Never raises.
  bool Open(const UTF16String& path);

  // Reads up to `capacity` bytes into `buffer`: the count read, 0 at the end of the file,
  // -1 on a read error. Never raises.
  long long Read(void* buffer, std::size_t capacity);

 private:
  // The platform's handle, kept as an integer so that this header names no OS type.
  long long handle_ = -1;
};

}  // namespace kelcore::xml
