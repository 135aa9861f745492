#include <kelcore/utility/StringStreams.h>

#include <deque>
#include <locale>
#include <streambuf>

namespace kelcore::utility::stream_detail {
namespace {

// Collects everything a narrow stream writes.
class CollectingBuffer : public std::streambuf {
 public:
  std::string text;

 protected:
  int_type overflow(int_type unit) override {
    if (!traits_type::eq_int_type(unit, traits_type::eof())) {
      text.push_back(traits_type::to_char_type(unit));
    }
    return traits_type::not_eof(unit);
  }
  std::streamsize xsputn(const char* units, std::streamsize count) override {
    text.append(units, static_cast<std::size_t>(count));
    return count;
  }
};

// Serves a borrowed span of characters to a narrow stream.
class SpanBuffer : public std::streambuf {
 public:
  void Reset(std::string_view text) {
    char* begin = const_cast<char*>(text.data());  // the get area is never written
    setg(begin, begin, begin + text.size());
  }
  std::size_t Consumed() const { return static_cast<std::size_t>(gptr() - eback()); }
};

struct ClassicFormatter {
  CollectingBuffer buffer;
  std::ostream stream{&buffer};
  ClassicFormatter() { stream.imbue(std::locale::classic()); }
};

struct ClassicParser {
  SpanBuffer buffer;
  std::istream stream{&buffer};
  ClassicParser() { stream.imbue(std::locale::classic()); }
};

// A value printed by a user's operator<< may itself use a string stream, so every
// nesting level on a thread gets its own formatter; std::deque keeps them in place.
thread_local std::deque<ClassicFormatter> formatters;
thread_local std::size_t formatterDepth = 0;

class FormatterLease {
 public:
  FormatterLease() {
    if (formatterDepth == formatters.size()) formatters.emplace_back();
    formatter_ = &formatters[formatterDepth++];
  }
  ~FormatterLease() { --formatterDepth; }
  FormatterLease(const FormatterLease&) = delete;
  FormatterLease& operator=(const FormatterLease&) = delete;
  ClassicFormatter& operator*() const { return *formatter_; }

 private:
  ClassicFormatter* formatter_;
};

}  // namespace

std::string_view FormatClassic(FormatState& state, NarrowWriter write, const void* value) {
  const FormatterLease lease;
  ClassicFormatter& formatter = *lease;
  std::ostream& stream = formatter.stream;
  formatter.buffer.text.clear();
  stream.clear();
  stream.flags(state.flags);
  stream.precision(state.precision);
  stream.width(state.width);
  stream.fill(state.fill);
  write(stream, value);
  state.flags = stream.flags();
  state.precision = stream.precision();
  state.width = stream.width();
  state.fill = stream.fill();
  return formatter.buffer.text;
}

ParseOutcome ParseClassic(FormatState& state, std::string_view text, NarrowReader read,
                          void* target) {
  // Reading a number never runs user code, so one parser per thread is enough.
  thread_local ClassicParser parser;
  std::istream& stream = parser.stream;
  parser.buffer.Reset(text);
  stream.clear();
  stream.flags(state.flags);
  stream.width(0);
  read(stream, target);
  state.flags = stream.flags();
  return {parser.buffer.Consumed(), stream.fail(), stream.eof()};
}

}  // namespace kelcore::utility::stream_detail
