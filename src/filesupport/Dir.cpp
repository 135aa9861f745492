#include <kelcore/filesupport/Dir.h>

#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/PathStrings.h>

#include "filesupport/FileHelper.h"

namespace kelcore::filesupport {

namespace FileUtils = utility::FileUtils;

namespace {

// 0 on success, else the system error code.
unsigned long CreateDirectoryNode(const UTF16String& nativePath);
unsigned long DeleteDirectoryNode(const UTF16String& nativePath);

bool IsPlainName(const UTF16String& name) {
  static constexpr UTF16Char kDot[] = {'.', 0};
  static constexpr UTF16Char kDotDot[] = {'.', '.', 0};
  if (name.empty() || name == kDot || name == kDotDot) return false;
  if (name.find(FileUtils::kNativeSeparator) != UTF16String::npos) return false;
  return FileUtils::kNativePathStyle != FileUtils::PathStyle::kWindows ||
         name.find(UTF16Char('/')) == UTF16String::npos;
}

bool IsNotFound(unsigned long code) {
  return code == detail::kErrorFileNotFound || code == detail::kErrorPathNotFound;
}

detail::NodeStatus StatusOrThrow(const Dir& dir) {
  detail::NodeStatus status;
  const unsigned long code = detail::QueryNodeStatus(dir.Helper().FullNativePath(),
                                                     detail::ObjectKind::kDirectory, status);
  if (IsNotFound(code)) throw dir_not_found_exception(dir);
  if (code != 0) throw dir_exception(dir);
  if (!status.isDirectory) throw dir_not_found_exception(dir);
  return status;
}

}  // namespace

Dir::Dir(const UTF16String& path) : helper_(path) {}
Dir::Dir(const std::string& systemPath) : helper_(systemPath) {}
Dir::Dir(const DirHelper& helper) : helper_(helper) {}
Dir::Dir(const Dir& parent, const UTF16String& name) : helper_(parent, name) {}

Dir::Dir(const Dir& parent, const UTF16String& name, bool createIfMissing) : helper_(parent, name) {
  if (createIfMissing) Create();
}

bool Dir::Exists() const {
  detail::NodeStatus status;
  return detail::QueryNodeStatus(helper_.FullNativePath(), detail::ObjectKind::kDirectory,
                                 status) == 0 &&
         status.isDirectory;
}

void Dir::Create() {
  const unsigned long code = CreateDirectoryNode(helper_.FullNativePath());
  if (code == 0) return;
  if (code == detail::kErrorAlreadyExists && Exists()) return;
  if (code == detail::kErrorPathNotFound) throw dir_not_found_exception(Parent());
  throw dir_create_exception(*this);
}

void Dir::Delete() {
  const unsigned long code = DeleteDirectoryNode(helper_.FullNativePath());
  if (code == 0) return;
  if (IsNotFound(code)) throw dir_not_found_exception(*this);
  throw dir_delete_exception(*this);
}

void Dir::Rename(const UTF16String& newName) {
  if (!IsPlainName(newName) || IsTopLevelDir()) throw rename_dir(*this, newName);
  if (!Exists()) throw dir_not_found_exception(*this);
  const Dir renamed(Parent(), newName);
  const unsigned long code = detail::RenameNoReplace(
      helper_.FullNativePath(), renamed.helper_.FullNativePath(), detail::ObjectKind::kDirectory);
  if (code == 0) {
    helper_ = renamed.helper_;
    return;
  }
  if (code == detail::kErrorAlreadyExists) throw rename_dir_already_exists(*this, newName);
  if (IsNotFound(code)) throw dir_not_found_exception(*this);
  throw rename_dir(*this, newName);
}

boost::posix_time::ptime Dir::Created() const {
  return StatusOrThrow(*this).created;
}

boost::posix_time::ptime Dir::Modified() const {
  return StatusOrThrow(*this).modified;
}

std::string Dir::FullPathMultiByte() const {
  return detail::SystemStringOf(FullPath());
}

UTF16String Dir::GetName() const {
  if (IsTopLevelDir()) return UTF16String();
  const UTF16String& path = FullPath();
  UTF16String title;
  UTF16String extension;
  FileUtils::SplitLongPath(path, nullptr, &title, &extension);
  return title + extension;
}

Dir Dir::Parent() const {
  UTF16String parent;
  if (!FileUtils::GetParentPath(FullPath(), parent)) return Dir();
  return Dir(parent);
}

}  // namespace kelcore::filesupport

#if defined(_WIN32)
#include "win/Dir.inc"
#else
#include "posix/Dir.inc"
#endif
