#include <kelcore/filesupport/FileUtils.h>

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/PathStrings.h>
#include <kelcore/filesupport/PathUtils.h>

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

#include "filesupport/CreateErrors.h"
#include "filesupport/PathEncoding.h"
#include "filesupport/SystemError.h"

#if defined(_WIN32)
#include "win/FileUtilsWholeFile.inc"
#else
#include "posix/FileUtilsWholeFile.inc"
#endif

namespace kelcore::utility::FileUtils {
namespace {

using filesupport::Dir;
using filesupport::File;

template <class ByteString>
void WriteBytes(const File& file, const ByteString& content) {
  const std::string nativePath = filesupport::detail::EncodePath(file.Helper().FullNativePath());
  if (nativePath.empty() || filesupport::detail::ContainsNul(nativePath)) {
    throw filesupport::create_invalidpath_exception(file);
  }
  const WholeFileResult result = WriteWholeFile(
      nativePath, reinterpret_cast<const unsigned char*>(content.data()), content.size());
  if (result.error == 0) return;
  if (result.openFailed) {
    filesupport::detail::ThrowCreateError(
        file, filesupport::detail::SystemErrorCode(
                  result.error, filesupport::detail::ObjectKind::kFile, nativePath));
  }
  throw filesupport::file_exception(file);
}

template <class ByteString>
void ReadBytes(const File& file, ByteString& content) {
  const std::string nativePath = filesupport::detail::EncodePath(file.Helper().FullNativePath());
  if (nativePath.empty() || filesupport::detail::ContainsNul(nativePath)) {
    throw filesupport::file_not_found_exception(file);
  }
  ByteString bytes;
  const WholeFileResult result = ReadWholeFile(nativePath, bytes);
  if (result.error != 0) {
    const unsigned long code = filesupport::detail::SystemErrorCode(
        result.error, filesupport::detail::ObjectKind::kFile, nativePath);
    const bool missing = code == filesupport::detail::kErrorFileNotFound ||
                         code == filesupport::detail::kErrorPathNotFound || result.error == EISDIR;
    if (result.openFailed && missing) throw filesupport::file_not_found_exception(file);
    throw filesupport::file_exception(file);
  }
  content.swap(bytes);
}

UTF16String DecimalText(std::uint64_t n) {
  const std::string digits = std::to_string(n);
  return UTF16String(digits.begin(), digits.end());
}

}  // namespace

void SimpleWriteStringToFile(const File& file, const UTF8String& content) {
  WriteBytes(file, content);
}

void SimpleWriteStringToFile(const File& file, const std::string& content) {
  WriteBytes(file, content);
}

void SimpleReadFileToString(const File& file, UTF8String& content) {
  ReadBytes(file, content);
}

void SimpleReadFileToString(const File& file, std::string& content) {
  ReadBytes(file, content);
}

void EnsureDirectoryExists(const Dir& dir) {
  if (dir.FullPath().empty()) throw filesupport::dir_create_exception(dir);
  // The missing levels, from `dir` upwards.
  std::vector<Dir> missing;
  Dir level = dir;
  while (!level.FullPath().empty() && !level.Exists()) {
    missing.push_back(level);
    Dir parent = level.Parent();
    if (parent.FullPath().size() >= level.FullPath().size()) break;
    level = parent;
  }
  for (auto it = missing.rbegin(); it != missing.rend(); ++it) {
    try {
      it->Create();
    } catch (const filesupport::dir_exception&) {
      // Created meanwhile by someone else is as good as created here.
      if (!it->Exists()) throw filesupport::dir_create_exception(*it);
    }
  }
}

UTF16String UniqueFileName(const UTF16String& dirPath, const UTF16String& base,
                           const UTF16String& extension) {
  const Dir dir(dirPath);
  if (!dir.Exists()) throw filesupport::dir_not_found_exception(dir);
  // A NUL would cut every candidate short at the same place, so that they all seemed
  // taken.
  if (base.find(UTF16Char(0)) != UTF16String::npos ||
      extension.find(UTF16Char(0)) != UTF16String::npos) {
    throw std::invalid_argument("UniqueFileName: the base name or extension holds a NUL");
  }
  UTF16String stem = dirPath;
  if (stem.empty() || stem.back() != kNativeSeparator) stem += kNativeSeparator;
  stem += base;
  for (std::uint64_t n = 1;; ++n) {
    const UTF16String candidate = stem + DecimalText(n) + extension;
    if (!EntryExists(filesupport::detail::EncodePath(filesupport::PrepAsLongPathName(candidate)))) {
      return candidate;
    }
  }
}

}  // namespace kelcore::utility::FileUtils
