// Parsing throughput of a large property-list-shaped document held in memory (about
// 16 MiB: pairs of keys with integer, float, escaped string and array values in nested
// lists, as the settings reader sees them).
//
// proplist_16mib@kelcore: the framework's ParseBuffer with a handler that overrides the
// plain StartElement/EndElement/Characters events and touches every string it receives,
// as the property-list reader does. proplist_16mib@expat: bare Expat with the same
// namespace and security settings and handlers that touch the same UTF-8 data, without
// UTF-16 conversion or the handler's attribute map. The ratio is the framework's cost.
#include <kelcore/xml/ExpatParserFactory.h>

#include <benchmark/benchmark.h>

#define XML_DTD
#include <expat.h>

#include <cstdint>
#include <cstring>
#include <memory>
#include <string>

namespace {

using namespace kelcore;
using namespace kelcore::xml;

const UTF8String& Document() {
  static const UTF8String document = [] {
    std::string text = "<?xml version='1.0'?>\n<prop.map version='4'>\n<prop.list>\n";
    for (int i = 0; text.size() < (16u << 20); ++i) {
      const std::string n = std::to_string(i);
      text += "<prop.pair>\n<key>setting " + n + "</key>\n<int type='signed' size='32'>" + n +
              "</int>\n</prop.pair>\n<prop.pair>\n<key>name " + n +
              "</key>\n<ustring>Caf\xC3\xA9 &amp; &lt;bar&gt; \xE2\x82\xAC" + n +
              "</ustring>\n</prop.pair>\n<prop.pair>\n<key>scale " + n +
              "</key>\n<double>0.3333333333333333</double>\n</prop.pair>\n";
      if (i % 16 == 0) {
        text += "<prop.pair>\n<key>rect " + n +
                "</key>\n<array>\n<array.type><int type='signed' size='32'/></array.type>\n"
                "<int type='signed' size='32'>0</int>\n<int type='signed' size='32'>0</int>\n"
                "<int type='signed' size='32'>640</int>\n<int type='signed' size='32'>480</int>\n"
                "</array>\n</prop.pair>\n<prop.pair>\n<key>sub " +
                n +
                "</key>\n<prop.list>\n<prop.pair>\n<key>x</key>\n<true/>\n</prop.pair>\n"
                "</prop.list>\n</prop.pair>\n";
      }
    }
    text += "</prop.list>\n</prop.map>\n";
    return UTF8String(text.begin(), text.end());
  }();
  return document;
}

class TouchingHandler : public AbstractParseHandler {
 public:
  void StartElement(const UTF16String& name, const AttributeMap& attributes) override {
    sum_ += name.size() + attributes.size();
  }
  void EndElement(const UTF16String& name) override { sum_ += name.size(); }
  void Characters(const UTF16String& text) override { sum_ += text.size(); }
  std::uint64_t Sum() const { return sum_; }

 private:
  std::uint64_t sum_ = 0;
};

void proplist_16mib_kelcore(benchmark::State& state) {
  const UTF8String& document = Document();
  auto owned = std::make_unique<TouchingHandler>();
  TouchingHandler* handler = owned.get();
  auto parser = ExpatParserFactory().GetParser(std::move(owned));
  for (auto _ : state) {
    if (parser->ParseBuffer(document) != kXMLParseSuccess) state.SkipWithError("parse failed");
  }
  benchmark::DoNotOptimize(handler->Sum());
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * document.size()));
}
BENCHMARK(proplist_16mib_kelcore)->Name("proplist_16mib@kelcore")->Unit(benchmark::kMillisecond);

void XMLCALL BareStart(void* sum, const char* name, const char** attributes) {
  std::size_t n = std::strlen(name);
  for (; *attributes != nullptr; attributes += 2) n += std::strlen(attributes[1]);
  *static_cast<std::uint64_t*>(sum) += n;
}
void XMLCALL BareEnd(void* sum, const char* name) {
  *static_cast<std::uint64_t*>(sum) += std::strlen(name);
}
void XMLCALL BareText(void* sum, const char*, int length) {
  *static_cast<std::uint64_t*>(sum) += static_cast<std::uint64_t>(length);
}

void proplist_16mib_expat(benchmark::State& state) {
  const UTF8String& document = Document();
  std::uint64_t sum = 0;
  for (auto _ : state) {
    XML_Parser parser = XML_ParserCreateNS(nullptr, '\x01');
    XML_SetReturnNSTriplet(parser, 1);
    XML_SetParamEntityParsing(parser, XML_PARAM_ENTITY_PARSING_NEVER);
    XML_SetBillionLaughsAttackProtectionMaximumAmplification(parser, 100.0f);
    XML_SetBillionLaughsAttackProtectionActivationThreshold(parser, 1u << 20);
    XML_SetUserData(parser, &sum);
    XML_SetElementHandler(parser, &BareStart, &BareEnd);
    XML_SetCharacterDataHandler(parser, &BareText);
    if (XML_Parse(parser, reinterpret_cast<const char*>(document.data()),
                  static_cast<int>(document.size()), 1) != XML_STATUS_OK) {
      state.SkipWithError("parse failed");
    }
    XML_ParserFree(parser);
  }
  benchmark::DoNotOptimize(sum);
  state.SetBytesProcessed(static_cast<std::int64_t>(state.iterations() * document.size()));
}
BENCHMARK(proplist_16mib_expat)->Name("proplist_16mib@expat")->Unit(benchmark::kMillisecond);

}  // namespace
