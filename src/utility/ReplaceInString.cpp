#include <kelcore/utility/ReplaceInString.h>

#include <array>

namespace kelcore::utility {
namespace {

constexpr std::size_t kArgumentCount = 10;

UTF16String Substitute(const UTF16String& text,
                       const std::array<const UTF16String*, kArgumentCount>& arguments) {
  UTF16String result;
  result.reserve(text.size());
  const std::size_t size = text.size();
  for (std::size_t i = 0; i < size; ++i) {
    const UTF16Char unit = text[i];
    if (unit != '@' || i + 1 == size) {
      result.push_back(unit);
      continue;
    }
    const UTF16Char next = text[++i];
    if (next >= '0' && next <= '9') {
      result += *arguments[static_cast<std::size_t>(next - '0')];
    } else if (next == '@') {
      result.push_back('@');
    } else {
      result.push_back('@');
      result.push_back(next);
    }
  }
  return result;
}

}  // namespace

UTF16String ReplaceInString(const UTF16String& text, const UTF16String& a0, const UTF16String& a1,
                            const UTF16String& a2, const UTF16String& a3, const UTF16String& a4,
                            const UTF16String& a5, const UTF16String& a6, const UTF16String& a7,
                            const UTF16String& a8, const UTF16String& a9) {
  return Substitute(text, {&a0, &a1, &a2, &a3, &a4, &a5, &a6, &a7, &a8, &a9});
}

UTF16String ReplaceInString(const UTF16String& text, const std::vector<UTF16String>& arguments) {
  static const UTF16String empty;
  std::array<const UTF16String*, kArgumentCount> pointers;
  for (std::size_t d = 0; d < kArgumentCount; ++d) {
    pointers[d] = d < arguments.size() ? &arguments[d] : &empty;
  }
  return Substitute(text, pointers);
}

}  // namespace kelcore::utility
