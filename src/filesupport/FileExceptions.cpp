#include <kelcore/filesupport/FileExceptions.h>

namespace kelcore::filesupport {

file_exception::file_exception(const File& file, const char* key)
    : file_(file), key_(key != nullptr ? key : kDefaultKey) {}
file_exception::~file_exception() = default;

file_not_found_exception::~file_not_found_exception() = default;
file_delete_exception::~file_delete_exception() = default;
create_exception::~create_exception() = default;
create_fnf_exception::~create_fnf_exception() = default;
create_locked_exception::~create_locked_exception() = default;
create_accessdenied_exception::~create_accessdenied_exception() = default;
create_invalidpath_exception::~create_invalidpath_exception() = default;

rename_file::rename_file(const File& file, const UTF16String& newName, const char* key)
    : file_exception(file, key != nullptr ? key : kDefaultKey), newName_(newName) {}
rename_file::~rename_file() = default;

dir_exception::dir_exception(const Dir& dir, const char* key)
    : dir_(dir), key_(key != nullptr ? key : kDefaultKey) {}
dir_exception::~dir_exception() = default;

dir_not_found_exception::~dir_not_found_exception() = default;
dir_create_exception::~dir_create_exception() = default;
dir_delete_exception::~dir_delete_exception() = default;

rename_dir::rename_dir(const Dir& dir, const UTF16String& newName, const char* key)
    : dir_exception(dir, key != nullptr ? key : kDefaultKey), newName_(newName) {}
rename_dir::~rename_dir() = default;

rename_dir_already_exists::~rename_dir_already_exists() = default;

}  // namespace kelcore::filesupport
