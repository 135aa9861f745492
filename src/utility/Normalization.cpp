#include <kelcore/utility/Normalization.h>

#include <unicode/unorm2.h>

#include <algorithm>
#include <cstdint>

namespace kelcore::utility {
namespace {

const UNormalizer2* NormalizerFor(UnicodeNormalizationForm form, UErrorCode* status) {
  switch (form) {
    case kNormalizationFormD:
      return unorm2_getNFDInstance(status);
    case kNormalizationFormKC:
      return unorm2_getNFKCInstance(status);
    case kNormalizationFormKD:
      return unorm2_getNFKDInstance(status);
    default:
      return unorm2_getNFCInstance(status);
  }
}

}  // namespace

UTF16String NormalizedString(const UTF16String& text, UnicodeNormalizationForm form) {
  if (form == kNormalizationNone || form == kNormalizationNoneAlt) return text;

  UErrorCode status = U_ZERO_ERROR;
  const UNormalizer2* normalizer = NormalizerFor(form, &status);
  if (U_FAILURE(status)) return text;

  const std::size_t end = text.find(UTF16Char{0});
  const std::size_t inputLength = end == UTF16String::npos ? text.size() : end;
  if (inputLength > static_cast<std::size_t>(INT32_MAX)) return text;
  const auto* input = reinterpret_cast<const UChar*>(text.data());

  // Already normalized text (the common case) is copied without a second pass.
  const int32_t quickLength =
      unorm2_spanQuickCheckYes(normalizer, input, static_cast<int32_t>(inputLength), &status);
  if (U_FAILURE(status)) return text;
  if (static_cast<std::size_t>(quickLength) == inputLength) return text.substr(0, inputLength);

  UTF16String out(std::min<std::size_t>(inputLength + inputLength / 2 + 8, INT32_MAX),
                  UTF16Char{0});
  for (int attempt = 0; attempt < 2; ++attempt) {
    status = U_ZERO_ERROR;
    const int32_t length = unorm2_normalize(normalizer, input, static_cast<int32_t>(inputLength),
                                            reinterpret_cast<UChar*>(out.data()),
                                            static_cast<int32_t>(out.size()), &status);
    if (status == U_BUFFER_OVERFLOW_ERROR) {
      out.assign(static_cast<std::size_t>(length), UTF16Char{0});
      continue;
    }
    if (U_FAILURE(status)) return text;
    out.resize(static_cast<std::size_t>(length));
    return out;
  }
  return text;
}

}  // namespace kelcore::utility
