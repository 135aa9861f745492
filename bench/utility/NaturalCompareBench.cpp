// Sorting 100,000 file names in natural order: kelcore's NaturalStringLessThan against
// an ICU collator with numeric ordering, both through std::sort over the same names.
#include <kelcore/utility/NaturalCompare.h>

#include <benchmark/benchmark.h>
#include <unicode/ucol.h>

#include <algorithm>
#include <memory>
#include <random>
#include <string>
#include <vector>

namespace {

using kelcore::UTF16String;

UTF16String Widen(const std::u16string& text) {
  return UTF16String(text.begin(), text.end());
}

std::u16string Number(std::mt19937& random, int maxValue, int width) {
  std::string digits = std::to_string(std::uniform_int_distribution<int>(0, maxValue)(random));
  if (static_cast<int>(digits.size()) < width) digits.insert(0, width - digits.size(), '0');
  return std::u16string(digits.begin(), digits.end());
}

template <typename T, std::size_t N>
const T& Pick(std::mt19937& random, const T (&items)[N]) {
  return items[std::uniform_int_distribution<std::size_t>(0, N - 1)(random)];
}

// Realistic names of a media library: camera files, tracks, chapters, episodes,
// versions, some in other scripts, in shuffled order.
std::vector<UTF16String> MakeFileNames(std::size_t count) {
  static const std::u16string kWords[] = {
      u"Song",   u"Intro", u"Live",  u"Remix", u"Café",    u"Ñandú",  u"Straße",   u"Überall",
      u"Москва", u"東京",  u"Ägäis", u"Demo",  u"The End", u"Résumé", u"Прелюдия", u"夜想曲"};
  static const std::u16string kExtensions[] = {u".jpg", u".mp3", u".flac", u".txt",
                                               u".mkv", u".png", u".m4a"};
  static const std::u16string kPrefixes[] = {u"IMG_",     u"DSC", u"Track ", u"chapter",
                                             u"Episode ", u"v",   u"Scan "};
  std::mt19937 random(42);
  std::vector<UTF16String> names;
  names.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    std::u16string name;
    switch (random() % 6) {
      case 0:
        name = Pick(random, kPrefixes) + Number(random, 9999, 4) + Pick(random, kExtensions);
        break;
      case 1:
        name = u"Track " + Number(random, 30, 0) + u" - " + Pick(random, kWords) + u".mp3";
        break;
      case 2:
        name = u"chapter" + Number(random, 40, 0) + u"/section" + Number(random, 12, 0) + u".txt";
        break;
      case 3:
        name = Pick(random, kWords) + u" " + Number(random, 2024, 0) + u" (" +
               Number(random, 99, 2) + u")" + Pick(random, kExtensions);
        break;
      case 4:
        name = u"Album " + Number(random, 20, 0) + u"/Disc " + Number(random, 3, 0) + u"/" +
               Number(random, 25, 2) + u" " + Pick(random, kWords) + u".flac";
        break;
      default:
        name = Pick(random, kPrefixes) + Number(random, 3, 0) + u"." + Number(random, 20, 0) +
               u"." + Number(random, 200, 0) + u" " + Pick(random, kWords);
        break;
    }
    names.push_back(Widen(name));
  }
  return names;
}

const std::vector<UTF16String>& FileNames() {
  static const std::vector<UTF16String> names = MakeFileNames(100000);
  return names;
}

template <typename Less>
void SortCopies(benchmark::State& state, Less less) {
  const std::vector<UTF16String>& names = FileNames();
  for (auto _ : state) {
    state.PauseTiming();
    std::vector<UTF16String> copy = names;
    state.ResumeTiming();
    std::sort(copy.begin(), copy.end(), less);
    benchmark::DoNotOptimize(copy.data());
    benchmark::ClobberMemory();
  }
  state.SetItemsProcessed(state.iterations() * static_cast<int64_t>(names.size()));
}

void NaturalSortKelcore(benchmark::State& state) {
  SortCopies(state, [](const UTF16String& a, const UTF16String& b) {
    return kelcore::utility::NaturalStringLessThan(a, b);
  });
}

// A root collator with numeric ordering; at secondary strength case is ignored, as the
// case-insensitive natural order ignores it.
void SortWithIcuCollator(benchmark::State& state, UColAttributeValue strength) {
  UErrorCode status = U_ZERO_ERROR;
  std::unique_ptr<UCollator, decltype(&ucol_close)> collator(ucol_open("", &status), &ucol_close);
  ucol_setAttribute(collator.get(), UCOL_NUMERIC_COLLATION, UCOL_ON, &status);
  ucol_setAttribute(collator.get(), UCOL_STRENGTH, strength, &status);
  if (U_FAILURE(status)) {
    state.SkipWithError("the ICU collator could not be opened");
    return;
  }
  const UCollator* coll = collator.get();
  SortCopies(state, [coll](const UTF16String& a, const UTF16String& b) {
    return ucol_strcoll(coll, reinterpret_cast<const UChar*>(a.data()),
                        static_cast<int32_t>(a.size()), reinterpret_cast<const UChar*>(b.data()),
                        static_cast<int32_t>(b.size())) == UCOL_LESS;
  });
}

void NaturalSortIcuCollator(benchmark::State& state) {
  SortWithIcuCollator(state, UCOL_TERTIARY);
}

void NaturalSortIcuCollatorCaseInsensitive(benchmark::State& state) {
  SortWithIcuCollator(state, UCOL_SECONDARY);
}

void NaturalSortKelcoreCaseInsensitive(benchmark::State& state) {
  SortCopies(state, [](const UTF16String& a, const UTF16String& b) {
    return kelcore::utility::CaseInsensitive::NaturalStringLessThan(a, b);
  });
}

}  // namespace

BENCHMARK(NaturalSortKelcore)->Name("natural_sort_100k@kelcore")->Unit(benchmark::kMillisecond);
BENCHMARK(NaturalSortIcuCollator)
    ->Name("natural_sort_100k@icu_collator")
    ->Unit(benchmark::kMillisecond);
BENCHMARK(NaturalSortKelcoreCaseInsensitive)
    ->Name("natural_sort_100k_case_insensitive@kelcore")
    ->Unit(benchmark::kMillisecond);
BENCHMARK(NaturalSortIcuCollatorCaseInsensitive)
    ->Name("natural_sort_100k_case_insensitive@icu_collator")
    ->Unit(benchmark::kMillisecond);
