#include "filesupport/SystemError.h"

#include <cerrno>

namespace kelcore::filesupport::detail {

namespace {

thread_local int lastTranslatedErrno = 0;

// Whether the directory that would hold `nativePath` is missing.
bool ParentDirectoryMissing(const std::string& nativePath) noexcept;

}  // namespace

unsigned long TranslateErrno(int errnoValue, ObjectKind kind, bool parentMissing) noexcept {
  switch (errnoValue) {
    case ENOENT:
      return parentMissing ? kErrorPathNotFound : kErrorFileNotFound;
    case ENOTDIR:
      return kErrorPathNotFound;
    case EACCES:
    case EPERM:
    case EISDIR:
      return kErrorAccessDenied;
    case EEXIST:
      return kind == ObjectKind::kFile ? kErrorFileExists : kErrorAlreadyExists;
    case EROFS:
      return kErrorWriteProtect;
    case EBADF:
      return kErrorInvalidHandle;
    case EMFILE:
    case ENFILE:
      return kErrorTooManyOpenFiles;
    case ENOSPC:
      return kErrorDiskFull;
    case ENAMETOOLONG:
      return kErrorFilenameExcedRange;
    case EBUSY:
    case ETXTBSY:
      return kErrorSharingViolation;
    case EINVAL:
      return kErrorInvalidParameter;
    default:
      return kErrorGeneralFailure;
  }
}

unsigned long SystemErrorCode(int errnoValue, ObjectKind kind,
                              const std::string& nativePath) noexcept {
  lastTranslatedErrno = errnoValue;
  const bool parentMissing = errnoValue == ENOENT && ParentDirectoryMissing(nativePath);
  return TranslateErrno(errnoValue, kind, parentMissing);
}

unsigned long LastSystemErrorCode(ObjectKind kind, const std::string& nativePath) noexcept {
  return SystemErrorCode(errno, kind, nativePath);
}

int LastTranslatedErrno() noexcept {
  return lastTranslatedErrno;
}

}  // namespace kelcore::filesupport::detail

#if defined(_WIN32)
#include "win/SystemError.inc"
#else
#include "posix/SystemError.inc"
#endif
