#include <kelcore/filesupport/File.h>

#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/PathStrings.h>
#include <kelcore/utility/CaseMapping.h>

#include "filesupport/CreateErrors.h"
#include "filesupport/FileHelper.h"

namespace kelcore::filesupport {

namespace FileUtils = utility::FileUtils;

namespace {

// 0 on success, else the system error code.
unsigned long CreateFileNode(const UTF16String& nativePath, bool failIfExists);
unsigned long DeleteFileNode(const UTF16String& nativePath);
// Whether the calling process may not open the file for writing.
unsigned long QueryReadOnly(const UTF16String& nativePath, bool& readOnly);

// A name that stays within its directory.
bool IsPlainName(const UTF16String& name) {
  static constexpr UTF16Char kDot[] = {'.', 0};
  static constexpr UTF16Char kDotDot[] = {'.', '.', 0};
  if (name.empty() || name == kDot || name == kDotDot) return false;
  if (name.find(FileUtils::kNativeSeparator) != UTF16String::npos) return false;
  return FileUtils::kNativePathStyle != FileUtils::PathStyle::kWindows ||
         name.find(UTF16Char('/')) == UTF16String::npos;
}

detail::NodeStatus StatusOrThrow(const File& file) {
  detail::NodeStatus status;
  const unsigned long code =
      detail::QueryNodeStatus(file.Helper().FullNativePath(), detail::ObjectKind::kFile, status);
  if (code == detail::kErrorFileNotFound || code == detail::kErrorPathNotFound) {
    throw file_not_found_exception(file);
  }
  if (code != 0) throw file_exception(file);
  return status;
}

}  // namespace

File::File(const UTF16String& path) : helper_(path) {}
File::File(const std::string& systemPath) : helper_(systemPath) {}
File::File(const FileHelper& helper) : helper_(helper) {}
File::File(const Dir& dir, const UTF16String& name) : helper_(dir, name) {}

File::File(const Dir& dir, const UTF16String& name, bool createIfMissing) : helper_(dir, name) {
  if (!createIfMissing) return;
  const unsigned long code = CreateFileNode(helper_.FullNativePath(), true);
  if (code != 0 && !Exists()) detail::ThrowCreateError(*this, code);
}

bool File::Exists() const {
  detail::NodeStatus status;
  return detail::QueryNodeStatus(helper_.FullNativePath(), detail::ObjectKind::kFile, status) == 0;
}

void File::Create(bool failIfExists) {
  const unsigned long code = CreateFileNode(helper_.FullNativePath(), failIfExists);
  if (code != 0) detail::ThrowCreateError(*this, code);
}

void File::Delete() {
  if (DeleteFileNode(helper_.FullNativePath()) != 0) throw file_delete_exception(*this);
}

void File::Rename(const UTF16String& newName) {
  if (!IsPlainName(newName)) throw rename_file(*this, newName);
  const File renamed(Parent(), newName);
  const unsigned long code = detail::RenameNoReplace(
      helper_.FullNativePath(), renamed.helper_.FullNativePath(), detail::ObjectKind::kFile);
  if (code != 0) throw rename_file(*this, newName);
  helper_ = renamed.helper_;
}

std::int64_t File::Size(FileSizeSelector which) const {
  const detail::NodeStatus status = StatusOrThrow(*this);
  if (status.isDirectory) throw file_not_found_exception(*this);
  return which == FileSizeSelector::kAllocatedSize ? status.allocatedSize : status.dataSize;
}

bool File::IsReadOnly() const {
  bool readOnly = false;
  const unsigned long code = QueryReadOnly(helper_.FullNativePath(), readOnly);
  if (code == detail::kErrorFileNotFound || code == detail::kErrorPathNotFound) {
    throw file_not_found_exception(*this);
  }
  if (code != 0) throw file_exception(*this);
  return readOnly;
}

boost::posix_time::ptime File::Created() const {
  return StatusOrThrow(*this).created;
}

boost::posix_time::ptime File::Modified() const {
  return StatusOrThrow(*this).modified;
}

std::string File::FullPathMultiByte() const {
  return detail::SystemStringOf(FullPath());
}

UTF16String File::GetName() const {
  const UTF16String& path = FullPath();
  UTF16String title;
  UTF16String extension;
  FileUtils::SplitLongPath(path, nullptr, &title, &extension);
  return title + extension;
}

UTF16String File::GetTitle() const {
  UTF16String title;
  FileUtils::SplitLongPath(FullPath(), nullptr, &title, nullptr);
  return title;
}

UTF16String File::GetExtension(bool lowerCase) const {
  UTF16String extension;
  FileUtils::SplitLongPath(FullPath(), nullptr, nullptr, &extension);
  if (lowerCase) utility::ToLowerCase(extension);
  return extension;
}

Dir File::Parent() const {
  UTF16String parent;
  if (!FileUtils::GetParentPath(FullPath(), parent)) return Dir();
  return Dir(parent);
}

}  // namespace kelcore::filesupport

#if defined(_WIN32)
#include "win/File.inc"
#else
#include "posix/File.inc"
#endif
