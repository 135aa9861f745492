// JSON reading and writing on a ~20 MB settings-and-messages document.
//
// parse_20mb: the text into a tree, the tree released in the timed loop as well (kelcore
// JSONParse; nlohmann::json::parse; RapidJSON Document::Parse with its pool allocator).
// write_20mb: the tree parsed once beforehand, written as compact text (kelcore
// GetJSONUTF8String; nlohmann dump(); RapidJSON Writer into a StringBuffer). kelcore
// writes doubles with 17 significant digits, the others their shortest form. Bytes
// processed are the document's bytes.
#include <kelcore/serialization/JSONParse.h>
#include <kelcore/serialization/JSONWriter.h>

#include <benchmark/benchmark.h>
#include <rapidjson/document.h>
#include <rapidjson/stringbuffer.h>
#include <rapidjson/writer.h>
#include <nlohmann/json.hpp>

#include <cstdint>
#include <string>

namespace {

using namespace kelcore::serialization;

class DocumentMaker {
 public:
  std::string Make(std::size_t targetBytes) {
    out_ = "{\"settings\":{";
    for (int group = 0; group < 400; ++group) {
      if (group) out_ += ',';
      out_ += "\"group" + std::to_string(group) + "\":";
      Settings(2);
    }
    out_ += "},\"messages\":[";
    for (int i = 0; out_.size() < targetBytes; ++i) {
      if (i) out_ += ',';
      Message(i);
    }
    out_ += "]}";
    return out_;
  }

 private:
  std::uint32_t Next() {
    state_ = state_ * 1664525u + 1013904223u;
    return state_ >> 8;
  }

  void Words(int count) {
    static const char* const kWords[] = {"the",   "render",      "queue",   "is",
                                         "ready", "caf\xC3\xA9", "export",  "\\\"preset\\\"",
                                         "frame", "done\\n",     "of",      "timeline",
                                         "audio", "track",       "\\u00e9", "clip"};
    for (int i = 0; i < count; ++i) {
      if (i) out_ += ' ';
      out_ += kWords[Next() % 16];
    }
  }

  void Settings(int depth) {
    out_ += '{';
    const int entries = 6 + static_cast<int>(Next() % 6);
    for (int i = 0; i < entries; ++i) {
      if (i) out_ += ',';
      out_ += "\"setting" + std::to_string(i) + "\":";
      switch (Next() % (depth > 0 ? 6 : 5)) {
        case 0:
          out_ += std::to_string(Next() % 100000);
          break;
        case 1:
          out_ += std::to_string(static_cast<int>(Next() % 2000) - 1000) + "." +
                  std::to_string(Next() % 1000);
          break;
        case 2:
          out_ += Next() % 2 ? "true" : "false";
          break;
        case 3:
          out_ += '"';
          Words(3);
          out_ += '"';
          break;
        case 4:
          out_ += "[1,2,3,\"four\",null]";
          break;
        default:
          Settings(depth - 1);
      }
    }
    out_ += '}';
  }

  void Message(int id) {
    out_ += "{\"id\":" + std::to_string(id) + ",\"from\":\"user" + std::to_string(Next() % 5000) +
            "\",\"text\":\"";
    Words(4 + static_cast<int>(Next() % 24));
    out_ += "\",\"time\":" + std::to_string(1700000000 + Next() % 10000000) + "." +
            std::to_string(Next() % 1000) + ",\"score\":-" + std::to_string(Next() % 100) + "." +
            std::to_string(Next() % 100000) + ",\"read\":" + (Next() % 2 ? "true" : "false") +
            ",\"priority\":" + std::to_string(Next() % 5) + ",\"tags\":[\"inbox\",\"t" +
            std::to_string(Next() % 50) + "\"],\"reply\":null}";
  }

  std::string out_;
  std::uint32_t state_ = 12345;
};

const std::string& Document() {
  static const std::string text = DocumentMaker().Make(20u << 20);
  return text;
}

const unsigned char* Bytes(const std::string& text) {
  return reinterpret_cast<const unsigned char*>(text.data());
}

void SetBytes(benchmark::State& state) {
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * Document().size()));
}

void parse_kelcore(benchmark::State& state) {
  const std::string& text = Document();
  for (auto _ : state) benchmark::DoNotOptimize(JSONParse(Bytes(text), text.size()));
  SetBytes(state);
}
BENCHMARK(parse_kelcore)->Name("parse_20mb@kelcore")->Unit(benchmark::kMillisecond);

void parse_nlohmann(benchmark::State& state) {
  const std::string& text = Document();
  for (auto _ : state) benchmark::DoNotOptimize(nlohmann::json::parse(text.begin(), text.end()));
  SetBytes(state);
}
BENCHMARK(parse_nlohmann)->Name("parse_20mb@nlohmann")->Unit(benchmark::kMillisecond);

void parse_rapidjson(benchmark::State& state) {
  const std::string& text = Document();
  for (auto _ : state) {
    rapidjson::Document document;
    document.Parse(text.c_str(), text.size());
    benchmark::DoNotOptimize(document.HasParseError());
  }
  SetBytes(state);
}
BENCHMARK(parse_rapidjson)->Name("parse_20mb@rapidjson")->Unit(benchmark::kMillisecond);

void write_kelcore(benchmark::State& state) {
  const JSONValue tree = JSONParse(Bytes(Document()), Document().size());
  for (auto _ : state) benchmark::DoNotOptimize(GetJSONUTF8String(*tree));
  SetBytes(state);
}
BENCHMARK(write_kelcore)->Name("write_20mb@kelcore")->Unit(benchmark::kMillisecond);

void write_nlohmann(benchmark::State& state) {
  const auto tree = nlohmann::json::parse(Document());
  for (auto _ : state) benchmark::DoNotOptimize(tree.dump());
  SetBytes(state);
}
BENCHMARK(write_nlohmann)->Name("write_20mb@nlohmann")->Unit(benchmark::kMillisecond);

void write_rapidjson(benchmark::State& state) {
  rapidjson::Document document;
  document.Parse(Document().c_str(), Document().size());
  for (auto _ : state) {
    rapidjson::StringBuffer buffer;
    rapidjson::Writer<rapidjson::StringBuffer> writer(buffer);
    document.Accept(writer);
    benchmark::DoNotOptimize(buffer.GetString());
  }
  SetBytes(state);
}
BENCHMARK(write_rapidjson)->Name("write_20mb@rapidjson")->Unit(benchmark::kMillisecond);

}  // namespace
