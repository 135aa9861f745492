// The one translation of errno values into the library's system error codes.
//
// The codes are the numbers the file model uses to choose its exceptions (2 file not
// found, 3 path not found, 5 access denied, ...). The table:
//
//   ENOENT                   2, or 3 when a parent directory of the path is missing
//   ENOTDIR                  3
//   EACCES, EPERM, EISDIR    5
//   EEXIST                   80 for files, 183 for directories and mappings
//   EROFS                    19
//   EBADF                    6
//   EMFILE, ENFILE           4
//   ENOSPC                   112
//   ENAMETOOLONG             206
//   EBUSY, ETXTBSY           32
//   EINVAL                   87
//   anything else (also 0)   31, general failure
//
// The raw errno is kept for diagnostics: SystemErrorCode leaves errno as it found it and
// records the value it translated for the calling thread (LastTranslatedErrno).
// Thread-safe: no shared state besides that thread-local record.
#pragma once

#include <string>

namespace kelcore::filesupport::detail {

enum class ObjectKind { kFile, kDirectory, kMapping };

inline constexpr unsigned long kErrorFileNotFound = 2;
inline constexpr unsigned long kErrorPathNotFound = 3;
inline constexpr unsigned long kErrorTooManyOpenFiles = 4;
inline constexpr unsigned long kErrorAccessDenied = 5;
inline constexpr unsigned long kErrorInvalidHandle = 6;
inline constexpr unsigned long kErrorWriteProtect = 19;
inline constexpr unsigned long kErrorGeneralFailure = 31;
inline constexpr unsigned long kErrorSharingViolation = 32;
inline constexpr unsigned long kErrorHandleEof = 38;
inline constexpr unsigned long kErrorFileExists = 80;
inline constexpr unsigned long kErrorInvalidParameter = 87;
inline constexpr unsigned long kErrorDiskFull = 112;
inline constexpr unsigned long kErrorAlreadyExists = 183;
inline constexpr unsigned long kErrorFilenameExcedRange = 206;

// The table as a pure function; `parentMissing` decides ENOENT (2 or 3).
unsigned long TranslateErrno(int errnoValue, ObjectKind kind, bool parentMissing) noexcept;

// The code for `errnoValue` met by a call on `nativePath` (the bytes handed to the
// system). For ENOENT it looks whether the directory holding the path exists (a path
// without "/" lies in the current directory, which exists). Never throws.
unsigned long SystemErrorCode(int errnoValue, ObjectKind kind,
                              const std::string& nativePath) noexcept;
// The same for the current errno.
unsigned long LastSystemErrorCode(ObjectKind kind, const std::string& nativePath) noexcept;

// The errno of this thread's last SystemErrorCode or LastSystemErrorCode call (0 before
// the first).
int LastTranslatedErrno() noexcept;

}  // namespace kelcore::filesupport::detail
