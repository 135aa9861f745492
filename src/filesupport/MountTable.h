// The table of mounted file systems, from the text of /proc/self/mountinfo.
//
// A mountinfo line reads
//   36 35 98:0 /mnt1 /mnt2 rw,noatime master:1 - ext3 /dev/root rw,errors=continue
// (mount id, parent id, major:minor, root, mount point, mount options, optional fields,
// "-", file system type, source, super options). Fields are separated by single spaces;
// the kernel writes space, tab, newline and backslash inside a field as the octal escapes
// \040, \011, \012 and \134. The parser decodes every "\ooo" of three octal digits up to
// \377; any other backslash is kept as it is. Lines that do not have all the fields up to
// the source, and mount points that are not absolute, are skipped, never guessed at.
//
// Paths are the bytes the kernel reports (see PathEncoding.h to make UTF-16 of them).
// The parser is a pure function; the reader is thread-safe.
#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kelcore::filesupport::detail {

struct MountEntry {
  std::string root;            // the directory of the file system mounted here
  std::string mountPoint;      // where it is mounted, absolute
  std::string fileSystemType;  // "ext4", "tmpfs", "fuse.sshfs", ...
  std::string source;          // "/dev/sda1", "tmpfs", "server:/export", ...
  bool readOnly = false;       // the mount options hold "ro"
};

// The entries of the table, in the order of the text (mount order).
std::vector<MountEntry> ParseMountInfo(std::string_view text);

// One field with its octal escapes decoded.
std::string DecodeMountField(std::string_view field);

// The index of the entry whose mount point holds `absolutePath` most closely: the
// longest mount point that equals the path or is a prefix of it ending at a "/"
// boundary; among entries of the same mount point the last (the one mounted on top).
// Empty when no entry matches (only when the table has no "/").
std::optional<std::size_t> FindContainingMount(const std::vector<MountEntry>& table,
                                               std::string_view absolutePath);

// The table of the calling process (/proc/self/mountinfo). Empty when it cannot be
// read.
std::vector<MountEntry> ReadMountTable();

}  // namespace kelcore::filesupport::detail
