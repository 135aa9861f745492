#include "xml/ExpatDocParser.h"

#include <algorithm>
#include <cstddef>
#include <utility>

#include "xml/DocumentFile.h"
#include "xml/ExpatSession.h"

namespace kelcore::xml {
namespace {

// Bytes read from a file per step.
constexpr std::size_t kReadSize = 64 * 1024;
// The most bytes of an in-memory document handed to Expat at once (its lengths are int).
constexpr std::size_t kMaxFeed = std::size_t{1} << 30;

class IgnoringHandler final : public AbstractParseHandler {};

}  // namespace

ExpatDocParser::ExpatDocParser(std::unique_ptr<AbstractParseHandler> handler)
    : AbstractDocParser(std::move(handler)) {}

ExpatDocParser::~ExpatDocParser() = default;

bool ExpatDocParser::HasNamespaceSupport() const {
  return true;
}

AbstractParseHandler& ExpatDocParser::Target() const {
  static IgnoringHandler ignoring;
  AbstractParseHandler* handler = Handler();
  return handler != nullptr ? *handler : ignoring;
}

XMLParseStatus ExpatDocParser::ParseDocument(const UTF16String& path) {
  DocumentFile file;
  if (!file.Open(path)) return kXMLParseFailure;
  AbstractParseHandler& handler = Target();
  ExpatSession session(handler);
  if (!session.Ready()) return kXMLParseFailure;
  handler.StartDocument();
  bool parsed = true;
  for (bool last = false; parsed && !last;) {
    void* buffer = session.Buffer(kReadSize);
    const long long count = buffer != nullptr ? file.Read(buffer, kReadSize) : -1;
    if (count < 0) {
      parsed = false;
      break;
    }
    last = count == 0;
    parsed = session.FeedBuffer(static_cast<std::size_t>(count), last);
  }
  session.Finish(parsed);
  return parsed ? kXMLParseSuccess : kXMLParseFailure;
}

XMLParseStatus ExpatDocParser::ParseBuffer(const UTF8String& bytes) {
  AbstractParseHandler& handler = Target();
  ExpatSession session(handler);
  if (!session.Ready()) return kXMLParseFailure;
  handler.StartDocument();
  const char* data = reinterpret_cast<const char*>(bytes.data());
  std::size_t left = bytes.size();
  bool parsed = true;
  do {
    const std::size_t size = std::min(left, kMaxFeed);
    left -= size;
    parsed = session.Feed(data, size, left == 0);
    data += size;
  } while (parsed && left != 0);
  session.Finish(parsed);
  return parsed ? kXMLParseSuccess : kXMLParseFailure;
}

}  // namespace kelcore::xml
