// The exceptions of the file and directory model.
//
// what() returns the localization key itself, a static string of the form
// "$$$/kelcore/filesupport/...=default English text" (never null, never freed). The catcher
// localizes it and replaces "@0" with the full path of the object (GetFile() or GetDir())
// and "@1" with the new name of a failed rename (GetNewName()). Every class has a
// constructor that takes only the object and uses the class's default key, and one that
// takes an explicit key; an explicit key must be a string that outlives the exception
// (a literal); a null key is replaced by the default key.
//
// file_exception
//   file_not_found_exception, file_delete_exception, rename_file,
//   create_exception
//     create_fnf_exception, create_locked_exception, create_accessdenied_exception,
//     create_invalidpath_exception
// dir_exception
//   dir_not_found_exception, dir_create_exception, dir_delete_exception,
//   rename_dir
//     rename_dir_already_exists
//
// Copying an exception copies the object and the new name; none of the members throws
// except the constructors (std::bad_alloc).
#pragma once

#include <exception>

#include <kelcore/Export.h>
#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::filesupport {

class KELCORE_API file_exception : public std::exception {
 public:
  static constexpr const char* kDefaultKey = "$$$/kelcore/filesupport/error=Error with file: '@0'.";

  explicit file_exception(const File& file) : file_exception(file, kDefaultKey) {}
  file_exception(const File& file, const char* key);
  file_exception(const file_exception&) = default;
  file_exception& operator=(const file_exception&) = default;
  ~file_exception() override;

  const char* what() const noexcept override { return key_; }
  const File& GetFile() const noexcept { return file_; }

 private:
  File file_;
  const char* key_;
};

class KELCORE_API file_not_found_exception : public file_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/FileNotFound=The file '@0' could not be found.";

  explicit file_not_found_exception(const File& file) : file_exception(file, kDefaultKey) {}
  file_not_found_exception(const File& file, const char* key)
      : file_exception(file, key ? key : kDefaultKey) {}
  ~file_not_found_exception() override;
};

class KELCORE_API file_delete_exception : public file_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Delete=Could not delete the file '@0'.";

  explicit file_delete_exception(const File& file) : file_exception(file, kDefaultKey) {}
  file_delete_exception(const File& file, const char* key)
      : file_exception(file, key ? key : kDefaultKey) {}
  ~file_delete_exception() override;
};

class KELCORE_API create_exception : public file_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Create=Could not create the file '@0'.";

  explicit create_exception(const File& file) : file_exception(file, kDefaultKey) {}
  create_exception(const File& file, const char* key)
      : file_exception(file, key ? key : kDefaultKey) {}
  ~create_exception() override;
};

class KELCORE_API create_fnf_exception : public create_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Create/fnf=Could not create the file '@0'. The file could not be "
      "found.";

  explicit create_fnf_exception(const File& file) : create_exception(file, kDefaultKey) {}
  create_fnf_exception(const File& file, const char* key)
      : create_exception(file, key ? key : kDefaultKey) {}
  ~create_fnf_exception() override;
};

class KELCORE_API create_locked_exception : public create_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Create/locked=Could not create the file '@0'. The disk is locked.";

  explicit create_locked_exception(const File& file) : create_exception(file, kDefaultKey) {}
  create_locked_exception(const File& file, const char* key)
      : create_exception(file, key ? key : kDefaultKey) {}
  ~create_locked_exception() override;
};

class KELCORE_API create_accessdenied_exception : public create_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Create/accessdenied=Could not create the file '@0'. Access was "
      "denied.";

  explicit create_accessdenied_exception(const File& file) : create_exception(file, kDefaultKey) {}
  create_accessdenied_exception(const File& file, const char* key)
      : create_exception(file, key ? key : kDefaultKey) {}
  ~create_accessdenied_exception() override;
};

class KELCORE_API create_invalidpath_exception : public create_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Create/invalidpath=Could not create the file '@0'. The path is not "
      "valid.";

  explicit create_invalidpath_exception(const File& file) : create_exception(file, kDefaultKey) {}
  create_invalidpath_exception(const File& file, const char* key)
      : create_exception(file, key ? key : kDefaultKey) {}
  ~create_invalidpath_exception() override;
};

// A failed File::Rename; GetNewName() is the name the file was to receive.
class KELCORE_API rename_file : public file_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Rename=Could not rename the file '@0' to '@1'.";

  rename_file(const File& file, const UTF16String& newName)
      : rename_file(file, newName, kDefaultKey) {}
  rename_file(const File& file, const UTF16String& newName, const char* key);
  ~rename_file() override;

  const UTF16String& GetNewName() const noexcept { return newName_; }

 private:
  UTF16String newName_;
};

class KELCORE_API dir_exception : public std::exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/Dir/error=Error with Directory: '@0'.";

  explicit dir_exception(const Dir& dir) : dir_exception(dir, kDefaultKey) {}
  dir_exception(const Dir& dir, const char* key);
  dir_exception(const dir_exception&) = default;
  dir_exception& operator=(const dir_exception&) = default;
  ~dir_exception() override;

  const char* what() const noexcept override { return key_; }
  const Dir& GetDir() const noexcept { return dir_; }

 private:
  Dir dir_;
  const char* key_;
};

class KELCORE_API dir_not_found_exception : public dir_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/DirNotFound=The directory '@0' could not be found.";

  explicit dir_not_found_exception(const Dir& dir) : dir_exception(dir, kDefaultKey) {}
  dir_not_found_exception(const Dir& dir, const char* key)
      : dir_exception(dir, key ? key : kDefaultKey) {}
  ~dir_not_found_exception() override;
};

class KELCORE_API dir_create_exception : public dir_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/DirCreate=The directory '@0' could not be created. Please check the "
      "parent directory protection or permission rights.";

  explicit dir_create_exception(const Dir& dir) : dir_exception(dir, kDefaultKey) {}
  dir_create_exception(const Dir& dir, const char* key)
      : dir_exception(dir, key ? key : kDefaultKey) {}
  ~dir_create_exception() override;
};

class KELCORE_API dir_delete_exception : public dir_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/DirDelete=Could not delete the directory '@0'.";

  explicit dir_delete_exception(const Dir& dir) : dir_exception(dir, kDefaultKey) {}
  dir_delete_exception(const Dir& dir, const char* key)
      : dir_exception(dir, key ? key : kDefaultKey) {}
  ~dir_delete_exception() override;
};

// A failed Dir::Rename; GetNewName() is the name the directory was to receive.
class KELCORE_API rename_dir : public dir_exception {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/DirRename=Could not rename the directory '@0' to '@1'.";

  rename_dir(const Dir& dir, const UTF16String& newName) : rename_dir(dir, newName, kDefaultKey) {}
  rename_dir(const Dir& dir, const UTF16String& newName, const char* key);
  ~rename_dir() override;

  const UTF16String& GetNewName() const noexcept { return newName_; }

 private:
  UTF16String newName_;
};

// The new name of a directory rename is taken already.
class KELCORE_API rename_dir_already_exists : public rename_dir {
 public:
  static constexpr const char* kDefaultKey =
      "$$$/kelcore/filesupport/DirRename/exists=Could not rename the directory '@0' to '@1'. "
      "The directory already exists.";

  rename_dir_already_exists(const Dir& dir, const UTF16String& newName)
      : rename_dir(dir, newName, kDefaultKey) {}
  rename_dir_already_exists(const Dir& dir, const UTF16String& newName, const char* key)
      : rename_dir(dir, newName, key ? key : kDefaultKey) {}
  ~rename_dir_already_exists() override;
};

}  // namespace kelcore::filesupport
