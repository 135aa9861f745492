// The application's language, as the host sets it.
//
// The host tells the library which language its user interface speaks (a code such as
// "en_US", "fr_FR" or "ja"); the library then loads its own dictionaries for that
// language (kelcore::config::Localizer::LoadKELDictionaries). Until the host sets one,
// the locale is not initialized and no dictionaries are loaded.
//
// All three functions may be called from any thread; the value is guarded by a mutex,
// and a reader sees either the old or the new code, never a mix.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::utility::Locale {

// True once SetApplicationLangauge has stored a non-empty code.
KELCORE_API bool IsInitialized();

// The code last set; empty while the locale is not initialized.
KELCORE_API UTF16String ApplicationLangauge();

// Stores `language`. The code becomes part of a folder name, so it may hold only ASCII
// letters, digits, "-" and "_", at most 64 units; anything else throws
// std::invalid_argument and leaves the stored code unchanged. An empty code returns
// the locale to the uninitialized state.
KELCORE_API void SetApplicationLangauge(const UTF16String& language);

}  // namespace kelcore::utility::Locale
