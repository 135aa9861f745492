// The exception that creating a file raises for a system error code, shared by
// File::Create and the whole-file writers so that both report a failure the same way.
#pragma once

namespace kelcore::filesupport {
class File;
}

namespace kelcore::filesupport::detail {

// Throws create_fnf_exception, create_invalidpath_exception,
// create_accessdenied_exception (the "already exists" codes included),
// create_locked_exception or create_exception for `code`, holding `file`.
[[noreturn]] void ThrowCreateError(const File& file, unsigned long code);

}  // namespace kelcore::filesupport::detail
