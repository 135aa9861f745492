#include <kelcore/config/Localizer.h>
#include <kelcore/utility/ReplaceInString.h>
#include <kelcore/utility/ZString.h>

namespace kelcore {

UTF16String ZString(const char* key, const UTF16String& a0, const UTF16String& a1,
                    const UTF16String& a2, const UTF16String& a3, const UTF16String& a4,
                    const UTF16String& a5, const UTF16String& a6, const UTF16String& a7,
                    const UTF16String& a8, const UTF16String& a9) {
  return utility::ReplaceInString(config::Localizer::Get()->LocalizeString(key), a0, a1, a2, a3, a4,
                                  a5, a6, a7, a8, a9);
}

}  // namespace kelcore
