#include "filesupport/MountTable.h"

#include <utility>

namespace kelcore::filesupport::detail {

namespace {

bool IsOctalDigit(char c) {
  return c >= '0' && c <= '7';
}

// \ooo naming a byte: three octal digits, at most \377.
bool IsByteEscape(std::string_view field, std::size_t at) {
  return at + 3 < field.size() && field[at] == '\\' && field[at + 1] <= '3' &&
         IsOctalDigit(field[at + 1]) && IsOctalDigit(field[at + 2]) && IsOctalDigit(field[at + 3]);
}

// Splits one line at single spaces.
std::vector<std::string_view> SplitFields(std::string_view line) {
  std::vector<std::string_view> fields;
  std::size_t start = 0;
  while (start <= line.size()) {
    const std::size_t space = line.find(' ', start);
    const std::size_t end = space == std::string_view::npos ? line.size() : space;
    fields.push_back(line.substr(start, end - start));
    if (space == std::string_view::npos) break;
    start = space + 1;
  }
  return fields;
}

bool HasOption(std::string_view options, std::string_view option) {
  std::size_t start = 0;
  while (start <= options.size()) {
    const std::size_t comma = options.find(',', start);
    const std::size_t end = comma == std::string_view::npos ? options.size() : comma;
    if (options.substr(start, end - start) == option) return true;
    if (comma == std::string_view::npos) break;
    start = comma + 1;
  }
  return false;
}

}  // namespace

std::string DecodeMountField(std::string_view field) {
  std::string result;
  result.reserve(field.size());
  for (std::size_t i = 0; i < field.size(); ++i) {
    if (IsByteEscape(field, i)) {
      const int value = (field[i + 1] - '0') * 64 + (field[i + 2] - '0') * 8 + (field[i + 3] - '0');
      result.push_back(static_cast<char>(value));
      i += 3;
    } else {
      result.push_back(field[i]);
    }
  }
  return result;
}

std::vector<MountEntry> ParseMountInfo(std::string_view text) {
  std::vector<MountEntry> table;
  std::size_t start = 0;
  while (start < text.size()) {
    std::size_t newline = text.find('\n', start);
    if (newline == std::string_view::npos) newline = text.size();
    const std::vector<std::string_view> fields = SplitFields(text.substr(start, newline - start));
    start = newline + 1;
    // Fields 0-5 are fixed; optional fields follow up to "-", then type and source.
    std::size_t separator = 6;
    while (separator < fields.size() && fields[separator] != "-") ++separator;
    if (separator + 2 >= fields.size()) continue;
    MountEntry entry;
    entry.root = DecodeMountField(fields[3]);
    entry.mountPoint = DecodeMountField(fields[4]);
    entry.fileSystemType = DecodeMountField(fields[separator + 1]);
    entry.source = DecodeMountField(fields[separator + 2]);
    entry.readOnly = HasOption(fields[5], "ro");
    if (entry.mountPoint.empty() || entry.mountPoint.front() != '/') continue;
    table.push_back(std::move(entry));
  }
  return table;
}

std::optional<std::size_t> FindContainingMount(const std::vector<MountEntry>& table,
                                               std::string_view absolutePath) {
  std::optional<std::size_t> best;
  std::size_t bestLength = 0;
  for (std::size_t i = 0; i < table.size(); ++i) {
    const std::string& mount = table[i].mountPoint;
    if (absolutePath.substr(0, mount.size()) != mount) continue;
    const bool boundary = mount.size() == absolutePath.size() || mount.back() == '/' ||
                          absolutePath[mount.size()] == '/';
    if (!boundary) continue;
    if (!best || mount.size() >= bestLength) {
      best = i;
      bestLength = mount.size();
    }
  }
  return best;
}

}  // namespace kelcore::filesupport::detail

#if defined(_WIN32)
#include "win/MountTable.inc"
#else
#include "posix/MountTable.inc"
#endif
