#include <kelcore/config/Localizer.h>
#include <kelcore/utility/Locale.h>

#include <stdexcept>

#include "config/AsciiText.h"
#include "config/AuxiliaryResources.h"

namespace kelcore::config {

Localizer* Localizer::S_localizerP = nullptr;

Localizer::~Localizer() = default;

void Localizer::Set(Localizer* localizer) {
  S_localizerP = localizer;
  if (localizer != nullptr) LoadKELDictionaries();
}

Localizer* Localizer::Get() {
  if (S_localizerP == nullptr) {
    throw std::logic_error(
        "kelcore::config::Localizer not initialized. Check kelcore/config/Localizer.");
  }
  return S_localizerP;
}

bool Localizer::Initialized() {
  return S_localizerP != nullptr;
}

void Localizer::LoadKELDictionaries() {
  if (S_localizerP == nullptr) return;
  // One read of the language: an empty code is the uninitialized locale.
  const UTF16String language = utility::Locale::ApplicationLangauge();
  if (language.empty()) return;
  const UTF16String folder =
      GetAuxiliaryResourcesPath(AsciiText("kel_") + language, AsciiText("dict"));
  if (!folder.empty()) S_localizerP->LoadDictionary(folder);
}

}  // namespace kelcore::config
