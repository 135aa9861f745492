// The process-wide localizer: turns a localization key into the text shown to the user.
//
// A localization key is a narrow 7-bit string "$$$/" + a path of names + "=" + the
// default English text, for example "$$$/kelcore/geom/matrix/UI=Matrix cannot be
// inverted."; the whole string, default text included, is what LocalizeString receives.
// The library defines only this interface and its slot; the host installs a concrete
// localizer (its own, or kelcore::config::DefaultLocalizer) at start-up.
//
// The slot is a plain pointer: the host sets it before other threads use localized
// text and leaves it alone while they do. Lookups run on any thread and are as
// thread-safe as the installed localizer.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::config {

class KELCORE_API Localizer {
 public:
  Localizer() = default;
  Localizer(const Localizer&) = delete;
  Localizer& operator=(const Localizer&) = delete;
  // Does not uninstall: the host calls Set(nullptr) before it destroys the installed
  // localizer.
  virtual ~Localizer();

  // The localized text for `key` (the whole key string).
  virtual UTF16String LocalizeString(const char* key) = 0;

  // Loads the dictionaries found in the directory `folder`.
  virtual void LoadDictionary(const UTF16String& folder) = 0;

  // Installs `localizer` (not owned; null uninstalls) and, when it is not null, calls
  // LoadKELDictionaries at once.
  static void Set(Localizer* localizer);

  // The installed localizer. With none installed throws std::logic_error
  // "kelcore::config::Localizer not initialized. Check kelcore/config/Localizer.".
  static Localizer* Get();

  static bool Initialized();

  // Loads the library's own dictionaries into the installed localizer. Does nothing
  // unless a localizer is installed and the application language is set
  // (kelcore::utility::Locale). The dictionaries of language L live beside the library
  // file itself, in <folder of the kelcore library>/kel_L/dict (the folder found from
  // an address inside the library: dladdr on POSIX, GetModuleHandleExW on Windows);
  // that path goes to LoadDictionary whether or not it exists. When the library's
  // folder cannot be determined nothing is loaded.
  static void LoadKELDictionaries();

 private:
  static Localizer* S_localizerP;
};

}  // namespace kelcore::config
