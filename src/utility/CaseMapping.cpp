#include <kelcore/utility/CaseMapping.h>

#include <unicode/uchar.h>

#include <array>
#include <bitset>
#include <cstdint>
#include <vector>

namespace kelcore::utility {
namespace {

enum Mapping { kFold = 0, kLower = 1, kUpper = 2, kTitle = 3, kMappingCount = 4 };

// Per unit, the four mappings as differences (mapped - unit) modulo 2^16: most blocks
// of 256 units map to themselves and then consist of zeros, so equal blocks are stored
// once and the whole table stays small.
using CaseEntry = std::array<std::uint16_t, kMappingCount>;
using CaseBlock = std::array<CaseEntry, 256>;

class CaseTable {
 public:
  CaseTable() {
    for (unsigned high = 0; high < 256; ++high) {
      CaseBlock block{};
      for (unsigned low = 0; low < 256; ++low) {
        const auto unit = static_cast<UChar32>((high << 8) | low);
        block[low] = EntryFor(unit);
        isWordUnit_[static_cast<std::size_t>(unit)] = IsWordCharacter(unit);
      }
      blockIndex_[high] = IndexOfBlock(block);
    }
  }

  UTF16Char Map(Mapping mapping, UTF16Char unit) const {
    const CaseEntry& entry = blocks_[blockIndex_[unit >> 8]][unit & 0xFF];
    return static_cast<UTF16Char>(static_cast<std::uint16_t>(unit + entry[mapping]));
  }

  bool IsWordUnit(UTF16Char unit) const { return isWordUnit_[unit]; }

 private:
  static CaseEntry EntryFor(UChar32 unit) {
    CaseEntry entry{};
    if (U_IS_SURROGATE(unit)) return entry;
    const UChar32 mapped[kMappingCount] = {u_foldCase(unit, U_FOLD_CASE_DEFAULT), u_tolower(unit),
                                           u_toupper(unit), u_totitle(unit)};
    for (int m = 0; m < kMappingCount; ++m) {
      // A mapping that leaves the Basic Multilingual Plane cannot be one unit: keep it.
      if (mapped[m] > 0xFFFF || U_IS_SURROGATE(mapped[m])) continue;
      entry[m] = static_cast<std::uint16_t>(mapped[m] - unit);
    }
    return entry;
  }

  static bool IsWordCharacter(UChar32 unit) {
    if (U_IS_SURROGATE(unit)) return true;
    constexpr std::uint32_t kWordCategories =
        U_GC_L_MASK | U_GC_M_MASK | U_GC_ND_MASK | U_GC_NL_MASK;
    return (U_GET_GC_MASK(unit) & kWordCategories) != 0 || u_hasBinaryProperty(unit, UCHAR_CASED);
  }

  std::uint8_t IndexOfBlock(const CaseBlock& block) {
    for (std::size_t i = 0; i < blocks_.size(); ++i) {
      if (blocks_[i] == block) return static_cast<std::uint8_t>(i);
    }
    blocks_.push_back(block);
    return static_cast<std::uint8_t>(blocks_.size() - 1);
  }

  std::array<std::uint8_t, 256> blockIndex_{};
  std::vector<CaseBlock> blocks_;
  std::bitset<0x10000> isWordUnit_;
};

const CaseTable& Table() {
  static const CaseTable table;
  return table;
}

void MapInPlace(Mapping mapping, UTF16String& text) {
  const CaseTable& table = Table();
  for (UTF16Char& unit : text) unit = table.Map(mapping, unit);
}

bool IsApostrophe(UTF16Char unit) {
  return unit == u'\'' || unit == 0x2019;
}

}  // namespace

void ToFoldCase(UTF16String& text) {
  MapInPlace(kFold, text);
}
void ToLowerCase(UTF16String& text) {
  MapInPlace(kLower, text);
}
void ToUpperCase(UTF16String& text) {
  MapInPlace(kUpper, text);
}

void ToTitleCase(UTF16String& text) {
  const CaseTable& table = Table();
  bool inWord = false;
  for (UTF16Char& unit : text) {
    if (table.IsWordUnit(unit)) {
      unit = table.Map(inWord ? kLower : kTitle, unit);
      inWord = true;
    } else if (!(inWord && IsApostrophe(unit))) {
      inWord = false;
    }
  }
}

UTF16String FoldCase(const UTF16String& text) {
  UTF16String copy(text);
  ToFoldCase(copy);
  return copy;
}
UTF16String LowerCase(const UTF16String& text) {
  UTF16String copy(text);
  ToLowerCase(copy);
  return copy;
}
UTF16String UpperCase(const UTF16String& text) {
  UTF16String copy(text);
  ToUpperCase(copy);
  return copy;
}
UTF16String TitleCase(const UTF16String& text) {
  UTF16String copy(text);
  ToTitleCase(copy);
  return copy;
}

}  // namespace kelcore::utility
