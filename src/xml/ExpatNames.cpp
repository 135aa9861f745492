#include "xml/ExpatNames.h"

#include <utility>

#include <kelcore/utility/UnicodeConversion.h>

namespace kelcore::xml {

const SplitName& ExpatNames::Split(const char* name) {
  const std::string_view text(name);
  if (const auto found = remembered_.find(text); found != remembered_.end()) {
    return found->second;
  }
  SplitName parts;
  SplitInto(text, parts);
  if (remembered_.size() < kMaxRemembered) {
    return remembered_.try_emplace(std::string(text), std::move(parts)).first->second;
  }
  unremembered_ = std::move(parts);
  return unremembered_;
}

void ExpatNames::SplitInto(std::string_view name, SplitName& parts) {
  const auto convert = [this](std::string_view part, UTF16String& out) {
    scratch_.assign(reinterpret_cast<const unsigned char*>(part.data()), part.size());
    out = utility::UTF8to16(scratch_);
  };
  const std::size_t uriEnd = name.find(separator_);
  if (uriEnd == std::string_view::npos) {
    parts.namespaceURI.clear();
    convert(name, parts.localName);
    parts.qualifiedName = parts.localName;
    return;
  }
  convert(name.substr(0, uriEnd), parts.namespaceURI);
  const std::string_view rest = name.substr(uriEnd + 1);
  const std::size_t localEnd = rest.find(separator_);
  convert(rest.substr(0, localEnd), parts.localName);
  if (localEnd == std::string_view::npos) {
    parts.qualifiedName = parts.localName;
    return;
  }
  convert(rest.substr(localEnd + 1), parts.qualifiedName);  // the prefix
  parts.qualifiedName.push_back(static_cast<UTF16Char>(':'));
  parts.qualifiedName += parts.localName;
}

}  // namespace kelcore::xml
