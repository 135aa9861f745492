// Localized text with "@0" to "@9" filled in.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore {

// Asks the installed localizer (kelcore::config::Localizer) for the text of `key` (a
// localization key, "$$$/..." + "=" + default text) and fills its placeholders "@0" to
// "@9" from a0 to a9 as kelcore::utility::ReplaceInString does. With no localizer
// installed it throws std::logic_error "kelcore::config::Localizer not initialized.
// Check kelcore/config/Localizer.". Thread safety is that of the installed localizer.
KELCORE_API UTF16String ZString(
    const char* key, const UTF16String& a0 = UTF16String(), const UTF16String& a1 = UTF16String(),
    const UTF16String& a2 = UTF16String(), const UTF16String& a3 = UTF16String(),
    const UTF16String& a4 = UTF16String(), const UTF16String& a5 = UTF16String(),
    const UTF16String& a6 = UTF16String(), const UTF16String& a7 = UTF16String(),
    const UTF16String& a8 = UTF16String(), const UTF16String& a9 = UTF16String());

}  // namespace kelcore
