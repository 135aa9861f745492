// Splits the names Expat reports ("uri SEP local SEP prefix", "uri SEP local" or "local")
// into the qualified name, namespace URI and local name in UTF-16, remembering the
// results: a document uses few distinct names, so most names are converted once. Used by
// one parse on one thread.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <unordered_map>

#include <kelcore/utility/StringTypes.h>

namespace kelcore::xml {

struct SplitName {
  UTF16String qualifiedName;
  UTF16String namespaceURI;
  UTF16String localName;
};

class ExpatNames {
 public:
  // The separator Expat was created with.
  explicit ExpatNames(char separator) : separator_(separator) {}

  // The parts of `name`. The reference stays valid until the next call, and for as long
  // as this object lives when IsLasting(result) says so.
  const SplitName& Split(const char* name);
  bool IsLasting(const SplitName& parts) const { return &parts != &unremembered_; }

 private:
  struct Hash {
    using is_transparent = void;
    std::size_t operator()(std::string_view text) const {
      return std::hash<std::string_view>()(text);
    }
  };

  void SplitInto(std::string_view name, SplitName& parts);

  // Caps the memory a document with very many distinct names can take.
  static constexpr std::size_t kMaxRemembered = 1024;

  char separator_;
  std::unordered_map<std::string, SplitName, Hash, std::equal_to<>> remembered_;
  SplitName unremembered_;
  UTF8String scratch_;
};

}  // namespace kelcore::xml
