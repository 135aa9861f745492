// The system calls and conversions shared by File, Dir and the directory listings.
//
// Every function that touches the file system takes a path in its native form
// (FileHelper::FullNativePath) and returns 0 on success or the library's system error
// code (SystemError.h) on failure; none throws except std::bad_alloc.
#pragma once

#include <boost/date_time/posix_time/ptime.hpp>
#include <cstdint>
#include <string>

#include <kelcore/utility/StringTypes.h>

#include "filesupport/SystemError.h"

namespace kelcore::filesupport::detail {

// A path given in the system's own encoding, as UTF-16 (POSIX: DecodePath of the bytes).
UTF16String PathFromSystemString(const std::string& systemPath);
// The path in the form handed to the system calls (POSIX: unchanged).
UTF16String NativePathOf(const UTF16String& path);
// The bytes that name the path in the system's own encoding (POSIX: EncodePath).
std::string SystemStringOf(const UTF16String& path);

struct NodeStatus {
  bool isDirectory = false;
  std::int64_t dataSize = 0;       // st_size
  std::int64_t allocatedSize = 0;  // st_blocks * 512
  boost::posix_time::ptime created;
  boost::posix_time::ptime modified;
};

// The status of whatever the path names, symbolic links followed. `kind` selects the
// error code of EEXIST-like failures (ObjectKind in SystemError.h).
unsigned long QueryNodeStatus(const UTF16String& nativePath, ObjectKind kind, NodeStatus& status);

// Renames `from` to `to` without ever replacing an existing entry at `to`: an existing
// `to` fails with the EEXIST code of `kind` (80 for files, 183 for directories).
unsigned long RenameNoReplace(const UTF16String& from, const UTF16String& to, ObjectKind kind);

}  // namespace kelcore::filesupport::detail
