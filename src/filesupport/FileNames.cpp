#include <kelcore/filesupport/FileNames.h>

#include <kelcore/utility/CaseMapping.h>
#include <kelcore/utility/Normalization.h>

#include <array>
#include <cstddef>
#include <string_view>

namespace kelcore::utility::FileUtils {
namespace {

constexpr UTF16Char kLastResort = u'-';

// The device names that Windows reserves in every directory, in the order they are
// matched; already in folded (lower) case.
constexpr std::array<std::u16string_view, 22> kReservedNames = {
    u"con",  u"prn",  u"aux",  u"nul",  u"com1", u"com2", u"com3", u"com4",
    u"com5", u"com6", u"com7", u"com8", u"com9", u"lpt1", u"lpt2", u"lpt3",
    u"lpt4", u"lpt5", u"lpt6", u"lpt7", u"lpt8", u"lpt9"};

bool IsIllegal(UTF16Char unit) {
  return GetIllegalFilenameCharacters().find(unit) != UTF16String::npos;
}

bool IsControl(UTF16Char unit) {
  return unit >= 1 && unit <= 31;
}

bool StartsWithFolded(const UTF16String& folded, std::u16string_view reserved) {
  if (folded.size() < reserved.size()) return false;
  for (std::size_t i = 0; i < reserved.size(); ++i) {
    if (folded[i] != static_cast<UTF16Char>(reserved[i])) return false;
  }
  return true;
}

// Replaces (or, with 0, removes) every unit for which `offends` holds.
template <class Predicate>
void ReplaceEach(UTF16String& name, UTF16Char replacement, Predicate offends) {
  std::size_t out = 0;
  for (const UTF16Char unit : name) {
    if (!offends(unit)) {
      name[out++] = unit;
    } else if (replacement != 0) {
      name[out++] = replacement;
    }
  }
  name.resize(out);
}

void ReplaceReservedName(UTF16String& name, UTF16Char replacement) {
  const UTF16String folded = FoldCase(name);
  for (const std::u16string_view reserved : kReservedNames) {
    if (!StartsWithFolded(folded, reserved)) continue;
    if (folded.size() == reserved.size()) {
      name += replacement != 0 ? replacement : kLastResort;
      return;
    }
    if (folded[reserved.size()] == u'.') {
      if (replacement != 0) {
        name[reserved.size()] = replacement;
      } else {
        name.replace(0, reserved.size(), 1, kLastResort);
      }
      return;
    }
    // Anything else after the reserved part ("COM10", "console"): not this entry.
  }
}

bool IsDotOrSpace(UTF16Char unit) {
  return unit == u'.' || unit == u' ';
}

void ReplaceTrailingDotsAndSpaces(UTF16String& name, UTF16Char replacement) {
  if (replacement != 0) {
    if (!name.empty() && IsDotOrSpace(name.back())) name.back() = replacement;
    return;
  }
  std::size_t end = name.size();
  while (end > 0 && IsDotOrSpace(name[end - 1])) --end;
  name.resize(end);
}

void ReplaceLeadingDots(UTF16String& name, UTF16Char replacement) {
  if (replacement != 0) {
    if (!name.empty() && name.front() == u'.') name.front() = replacement;
    return;
  }
  const std::size_t first = name.find_first_not_of(u'.');
  name.erase(0, first == UTF16String::npos ? name.size() : first);
}

}  // namespace

const UTF16String& GetIllegalFilenameCharacters() {
  static const UTF16String kIllegal(u"\\/:*?\"<>|");
  return kIllegal;
}

bool ReplaceIllegalFileNameCharacters(UTF16String& name, UTF16Char replacement) {
  if (name.empty()) return false;
  const UTF16String original = name;

  if (replacement != 0 &&
      (IsIllegal(replacement) || IsControl(replacement) || IsDotOrSpace(replacement))) {
    replacement = kLastResort;
  }
  ReplaceEach(name, replacement, IsIllegal);
  ReplaceEach(name, replacement, IsControl);
  ReplaceReservedName(name, replacement);
  ReplaceTrailingDotsAndSpaces(name, replacement);
  ReplaceLeadingDots(name, replacement);
  // Trimming may have uncovered a reserved name ("con " or "..aux.txt" when removing,
  // "co." with the replacement "n"): treat it once more. What that leaves is never
  // reserved and needs no more trimming.
  ReplaceReservedName(name, replacement);
  if (replacement == 0 && name.empty()) name.assign(1, kLastResort);
  return name != original;
}

UTF16String NormalizePathForSaving(const UTF16String& path) {
  return NormalizedString(path, kNormalizationNone);
}

UTF16String NormalizePathForStringComparison(const UTF16String& path) {
  return FoldCase(NormalizePathForSaving(path));
}

bool PathsEqual(const UTF16String& a, const UTF16String& b) {
  return NormalizePathForStringComparison(a) == NormalizePathForStringComparison(b);
}

}  // namespace kelcore::utility::FileUtils
