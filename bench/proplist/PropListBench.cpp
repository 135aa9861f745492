// Loading and saving a large property list (a document of about 20 MB: 850 nested
// lists of settings with integers, floats, doubles, escaped and non-ASCII texts,
// bools and arrays, as applications keep them).
//
// load_20mb@kelcore: LoadPropList of the file into an empty list (the XML framework over
// Expat, the property list handler, building the typed tree).
// load_20mb@expat: the same file read into memory and parsed by bare Expat
// (XML_ParserCreate, no namespace processing, element and text handlers that do
// nothing). The ratio is what the whole reader costs over parsing alone.
// save_20mb@kelcore: SavePropList of the list over the existing file (writing the
// document, the safe save with its flushes to disk).
// save_20mb@write_fsync: the same bytes written over a file with write(2) and fsync, the
// disk's own cost of the save.
// write_20mb@kelcore: WritePropList alone, the document assembled in memory.
// The files live in $TMPDIR (else /tmp) and are removed at exit.
#include <kelcore/config/DefaultErrorManager.h>
#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/Localizer.h>
#include <kelcore/proplist/PropListUtils.h>
#include <kelcore/xml/DefaultParserFactory.h>
#include <kelcore/xml/ParserFactorySlot.h>

#include <benchmark/benchmark.h>
#include <expat.h>
#include <fcntl.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <list>
#include <sstream>
#include <string>

namespace {

using namespace kelcore;
using namespace kelcore::proplist;

UTF8String U8(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}
UTF16String U16(const std::u16string& text) {
  return UTF16String(text.begin(), text.end());
}

// KELCORE_PLIST_BENCH_GROUPS makes a smaller document, for profiling.
int Groups() {
  const char* groups = std::getenv("KELCORE_PLIST_BENCH_GROUPS");
  return groups != nullptr ? std::atoi(groups) : 850;
}

PropList MakeList() {
  PropList list;
  const int groups = Groups();
  for (int group = 0; group < groups; ++group) {
    PropList* settings = list.NewSubList(U8("group " + std::to_string(group)));
    for (int i = 0; i < 40; ++i) {
      const std::string n = std::to_string(i);
      const std::u16string n16(n.begin(), n.end());
      settings->SetValue(U8("count " + n), std::int32_t{group * 1000 + i});
      settings->SetValue(U8("size " + n), std::uint64_t{1} << (i % 64));
      settings->SetValue(U8("scale " + n), 1.0 / (i + 3));
      settings->SetValue(U8("gain " + n), static_cast<float>(i) * 0.37f);
      settings->SetValue(U8("name " + n), U16(u"Caf\u00e9 & <bar> \u20ac" + n16));
      settings->SetValue(U8("path " + n), U8("/home/user/Documents/Project " + n + ".mov"));
      settings->SetValue(U8("enabled " + n), i % 3 == 0);
      if (i % 8 == 0) {
        settings->SetValue(U8("rect " + n), std::list<std::int32_t>{0, 0, 640 + i, 480});
        settings->SetValue(U8("curve " + n), std::list<double>{0.0, 0.25, 0.5, 1.0});
        settings->SetValue(U8("recent " + n),
                           std::list<UTF16String>{U16(u"first"), U16(u"second \u00fc")});
      }
    }
  }
  return list;
}

struct Fixture {
  Fixture() {
    kelcore::config::Localizer::Set(&localizer);
    kelcore::config::ErrorManager::Set(&manager);
    xml::SetParserFactory(xml::CreateDefaultParserFactory());
    const char* tmp = std::getenv("TMPDIR");
    directory = std::filesystem::path(tmp != nullptr && *tmp != '\0' ? tmp : "/tmp") /
                ("kelcore-plist-bench-" + std::to_string(::getpid()));
    std::filesystem::create_directories(directory);
    const std::string loadPath = (directory / "load.xml").string();
    const std::string savePath = (directory / "save.xml").string();
    load = UTF16String(loadPath.begin(), loadPath.end());
    save = UTF16String(savePath.begin(), savePath.end());
    utils::WritePropList(document, list);
    utils::SavePropList(load, list);
    utils::SavePropList(save, list);
  }
  ~Fixture() {
    std::error_code ignored;
    std::filesystem::remove_all(directory, ignored);
  }
  kelcore::config::DefaultLocalizer localizer;
  kelcore::config::DefaultErrorManager manager;
  PropList list = MakeList();
  UTF8String document;
  std::filesystem::path directory;
  UTF16String load;
  UTF16String save;
};

Fixture& Shared() {
  static Fixture fixture;
  return fixture;
}

void Bytes(benchmark::State& state) {
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations()) *
                          static_cast<std::int64_t>(Shared().document.size()));
}

void load_kelcore(benchmark::State& state) {
  Fixture& f = Shared();
  for (auto _ : state) {
    PropList list;
    utils::LoadPropList(f.load, list, false);
    benchmark::DoNotOptimize(list.GetPropertyCount());
  }
  Bytes(state);
}

void XMLCALL NoStart(void*, const char*, const char**) {}
void XMLCALL NoEnd(void*, const char*) {}
void XMLCALL NoText(void*, const char*, int) {}

void load_expat(benchmark::State& state) {
  Fixture& f = Shared();
  const std::string path = (f.directory / "load.xml").string();
  for (auto _ : state) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream bytes;
    bytes << in.rdbuf();
    const std::string text = bytes.str();
    XML_Parser parser = XML_ParserCreate(nullptr);
    XML_SetElementHandler(parser, &NoStart, &NoEnd);
    XML_SetCharacterDataHandler(parser, &NoText);
    if (XML_Parse(parser, text.data(), static_cast<int>(text.size()), 1) != XML_STATUS_OK) {
      state.SkipWithError("parse failed");
    }
    XML_ParserFree(parser);
  }
  Bytes(state);
}

void save_kelcore(benchmark::State& state) {
  Fixture& f = Shared();
  for (auto _ : state) utils::SavePropList(f.save, f.list);
  Bytes(state);
}

void save_write_fsync(benchmark::State& state) {
  Fixture& f = Shared();
  const std::string path = (f.directory / "raw.xml").string();
  for (auto _ : state) {
    const int fd = ::open(path.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    const unsigned char* data = f.document.data();
    std::size_t left = f.document.size();
    while (left > 0) {
      const ssize_t written = ::write(fd, data, left);
      if (written <= 0) break;
      data += written;
      left -= static_cast<std::size_t>(written);
    }
    if (left != 0 || ::fsync(fd) != 0) state.SkipWithError("write failed");
    ::close(fd);
  }
  Bytes(state);
}

void write_kelcore(benchmark::State& state) {
  Fixture& f = Shared();
  UTF8String out;
  for (auto _ : state) {
    utils::WritePropList(out, f.list);
    benchmark::DoNotOptimize(out.data());
  }
  Bytes(state);
}

BENCHMARK(load_kelcore)->Name("load_20mb@kelcore")->Unit(benchmark::kMillisecond);
BENCHMARK(load_expat)->Name("load_20mb@expat")->Unit(benchmark::kMillisecond);
BENCHMARK(save_kelcore)->Name("save_20mb@kelcore")->Unit(benchmark::kMillisecond);
BENCHMARK(save_write_fsync)->Name("save_20mb@write_fsync")->Unit(benchmark::kMillisecond);
BENCHMARK(write_kelcore)->Name("write_20mb@kelcore")->Unit(benchmark::kMillisecond);

}  // namespace
