// A localizer that answers every key with its default text, or with the translation
// loaded from a dictionary folder.
//
// A key "$$$/path/name=Default text" splits at its first "=" into the lookup part
// ("$$$/path/name") and the default text. LocalizeString returns the translation of
// the lookup part when a loaded dictionary has one, else the default text (read as
// UTF-8). A key without "=" is its own default text; a null key gives an empty text.
//
// Dictionary folder format. LoadDictionary(folder) reads every regular file in
// `folder` whose name ends in ".txt", in byte order of the names; other files and
// sub-folders are ignored, and a folder that does not exist or cannot be read loads
// nothing (the library offers its dictionary folder whether or not it exists). Each
// file is UTF-8 text, with an optional byte order mark, in lines ended by LF or CR LF:
//
//   # French texts of kelcore
//   $$$/kelcore/geom/matrix/UI=La matrice ne peut pas être inversée.
//   $$$/kelcore/config/Error/test/fataltest=Ceci est une exception fatale.\nFin.
//
// - An entry is the lookup part (starting with "$$$/"), "=", and the translation: the
//   rest of the line, kept exactly, spaces included, with the escapes \n (line feed),
//   \t (TAB) and \\ (one backslash); a backslash before any other character is kept.
// - Empty lines, lines whose first character is "#", lines that do not start with
//   "$$$/" or hold no "=", and entries whose translation is not valid UTF-8 are
//   skipped.
// - A later entry for the same lookup part replaces an earlier one, across files and
//   across calls: loading adds to what was loaded before.
//
// Thread-safe: lookups may run on any threads while another thread loads. A load reads
// its files first and then adds their entries under a reader-writer lock, so a lookup
// sees all the entries of one LoadDictionary call or none of them.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/config/Localizer.h>

#include <cstddef>
#include <functional>
#include <shared_mutex>
#include <string>
#include <string_view>
#include <unordered_map>

namespace kelcore::config {

class KELCORE_API DefaultLocalizer : public Localizer {
 public:
  DefaultLocalizer();
  ~DefaultLocalizer() override;

  UTF16String LocalizeString(const char* key) override;
  void LoadDictionary(const UTF16String& folder) override;

  // The number of lookup parts with a translation.
  std::size_t GetEntryCount() const;

 private:
  // Lets a lookup part be found without copying it out of the key.
  struct LookupHash {
    using is_transparent = void;
    std::size_t operator()(std::string_view text) const noexcept {
      return std::hash<std::string_view>()(text);
    }
  };

  mutable std::shared_mutex mutex_;
  std::unordered_map<std::string, UTF16String, LookupHash, std::equal_to<>> translations_;
};

}  // namespace kelcore::config
