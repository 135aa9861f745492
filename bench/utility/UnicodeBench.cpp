// UTF-16 <-> UTF-8 conversion of 1 MiB of text (its UTF-8 size) in four kinds of text,
// kelcore against ICU in the same run.
//
// kelcore returns a new string of the exact size on every call, allocation included.
// "icu" does the same work the cheapest way ICU allows: u_strToUTF8/u_strFromUTF8 into
// a scratch buffer of the largest size the input can need (allocated once, before
// timing), then a string of the exact size copied from it. "icu-buffer" is the
// conversion into the scratch buffer alone, with no result string.
#include <kelcore/utility/UnicodeConversion.h>

#include <benchmark/benchmark.h>
#include <unicode/ustring.h>

#include <cstdint>
#include <string>
#include <vector>

namespace {

using kelcore::UTF16String;
using kelcore::UTF8String;

constexpr std::size_t kTextBytes = 1 << 20;

// Text made of words drawn with a fixed pseudo-random sequence, cut at a character
// boundary just under kTextBytes of UTF-8.
UTF8String MakeText(const std::vector<std::u8string>& words, const char8_t* separator) {
  std::uint32_t state = 12345;
  std::u8string text;
  while (text.size() < kTextBytes + 64) {
    state = state * 1664525u + 1013904223u;
    text += words[(state >> 8) % words.size()];
    text += separator;
  }
  std::size_t end = kTextBytes;
  while ((static_cast<unsigned char>(text[end]) & 0xC0) == 0x80) --end;
  return UTF8String(reinterpret_cast<const unsigned char*>(text.data()), end);
}

const UTF8String& Text(int kind) {
  static const UTF8String texts[] = {
      MakeText({u8"the", u8"quick", u8"brown", u8"fox", u8"jumps", u8"over", u8"lazy", u8"dog,",
                u8"and", u8"then", u8"it", u8"rests.", u8"Media", u8"files", u8"library"},
               u8" "),
      MakeText({u8"été",  u8"garçon", u8"déjà",  u8"très",  u8"la",      u8"maison",
                u8"über", u8"Straße", u8"Grüße", u8"schön", u8"und",     u8"der",
                u8"Việt", u8"tiếng",  u8"người", u8"không", u8"và",      u8"với",
                u8"café", u8"naïve",  u8"est",   u8"pour",  u8"Mädchen", u8"Haus"},
               u8" "),
      MakeText({u8"日本語", u8"の", u8"文章", u8"です", u8"中文", u8"测试", u8"文字", u8"変換",
                u8"한국어", u8"텍스트", u8"東京", u8"北京", u8"、", u8"。", u8"データ", u8"处理"},
               u8""),
      MakeText({u8"hello", u8"😀", u8"world", u8"🎉", u8"naïve", u8"日本", u8"👍🏽", u8"party",
                u8"🚀", u8"ok", u8"Ñandú", u8"🙂", u8"the", u8"and", u8"中文", u8"😂"},
               u8" "),
  };
  return texts[kind];
}

const UTF16String& Text16(int kind) {
  static const UTF16String texts[] = {
      kelcore::utility::UTF8to16(Text(0)), kelcore::utility::UTF8to16(Text(1)),
      kelcore::utility::UTF8to16(Text(2)), kelcore::utility::UTF8to16(Text(3))};
  return texts[kind];
}

void UTF16to8Kelcore(benchmark::State& state, int kind) {
  const UTF16String& input = Text16(kind);
  for (auto _ : state) {
    UTF8String out = kelcore::utility::UTF16to8(input);
    benchmark::DoNotOptimize(out.data());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * Text(kind).size()));
}

// Converts into `buffer`; returns the length, or -1 on failure.
std::int32_t IcuToUTF8(const UTF16String& input, std::vector<char>& buffer) {
  UErrorCode status = U_ZERO_ERROR;
  std::int32_t length = 0;
  u_strToUTF8(buffer.data(), static_cast<std::int32_t>(buffer.size()), &length, input.data(),
              static_cast<std::int32_t>(input.size()), &status);
  return U_FAILURE(status) ? -1 : length;
}

void UTF16to8Icu(benchmark::State& state, int kind, bool makeString) {
  const UTF16String& input = Text16(kind);
  std::vector<char> buffer(input.size() * 3);
  for (auto _ : state) {
    const std::int32_t length = IcuToUTF8(input, buffer);
    if (length < 0) state.SkipWithError("u_strToUTF8 failed");
    if (makeString) {
      UTF8String out(reinterpret_cast<const unsigned char*>(buffer.data()),
                     static_cast<std::size_t>(length));
      benchmark::DoNotOptimize(out.data());
    }
    benchmark::DoNotOptimize(buffer.data());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * Text(kind).size()));
}

void UTF8to16Kelcore(benchmark::State& state, int kind) {
  const UTF8String& input = Text(kind);
  for (auto _ : state) {
    UTF16String out = kelcore::utility::UTF8to16(input);
    benchmark::DoNotOptimize(out.data());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * input.size()));
}

std::int32_t IcuToUTF16(const UTF8String& input, std::vector<UChar>& buffer) {
  UErrorCode status = U_ZERO_ERROR;
  std::int32_t length = 0;
  u_strFromUTF8(buffer.data(), static_cast<std::int32_t>(buffer.size()), &length,
                reinterpret_cast<const char*>(input.data()),
                static_cast<std::int32_t>(input.size()), &status);
  return U_FAILURE(status) ? -1 : length;
}

void UTF8to16Icu(benchmark::State& state, int kind, bool makeString) {
  const UTF8String& input = Text(kind);
  std::vector<UChar> buffer(input.size());
  for (auto _ : state) {
    const std::int32_t length = IcuToUTF16(input, buffer);
    if (length < 0) state.SkipWithError("u_strFromUTF8 failed");
    if (makeString) {
      UTF16String out(buffer.data(), static_cast<std::size_t>(length));
      benchmark::DoNotOptimize(out.data());
    }
    benchmark::DoNotOptimize(buffer.data());
  }
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * input.size()));
}

const char* const kKinds[] = {"ascii", "latin", "cjk", "emoji"};

[[maybe_unused]] const bool registered = [] {
  for (int kind = 0; kind < 4; ++kind) {
    const std::string name = kKinds[kind];
    const std::string to8 = "utf16to8/" + name;
    const std::string to16 = "utf8to16/" + name;
    benchmark::RegisterBenchmark((to8 + "@kelcore").c_str(), UTF16to8Kelcore, kind);
    benchmark::RegisterBenchmark((to8 + "@icu").c_str(), UTF16to8Icu, kind, true);
    benchmark::RegisterBenchmark((to8 + "@icu-buffer").c_str(), UTF16to8Icu, kind, false);
    benchmark::RegisterBenchmark((to16 + "@kelcore").c_str(), UTF8to16Kelcore, kind);
    benchmark::RegisterBenchmark((to16 + "@icu").c_str(), UTF8to16Icu, kind, true);
    benchmark::RegisterBenchmark((to16 + "@icu-buffer").c_str(), UTF8to16Icu, kind, false);
  }
  return true;
}();

}  // namespace
