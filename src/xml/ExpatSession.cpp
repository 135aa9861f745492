#include "xml/ExpatSession.h"

// The amplification limits are declared only for Expat builds with DTD support, which
// every supported Expat (2.4 and later, as packaged) is.
#ifndef XML_DTD
#define XML_DTD
#endif
#include <expat.h>

#include <cstring>
#include <utility>

#include <kelcore/utility/UnicodeConversion.h>

#if XML_MAJOR_VERSION < 2 || (XML_MAJOR_VERSION == 2 && XML_MINOR_VERSION < 4)
#error "Expat 2.4 or later is needed for its entity amplification limits"
#endif

namespace kelcore::xml {
namespace {

// Separates URI, local name and prefix in the names Expat reports. U+0001 cannot occur
// in an XML 1.0 document, not even through a character reference, and Expat refuses a
// namespace URI that contains its separator.
constexpr char kNameSeparator = '\x01';

// Adjacent character data is held back and delivered as one Characters call once other
// markup follows or it reaches this many bytes of UTF-8, so a longer run of text arrives
// in more than one call.
constexpr std::size_t kMaxHeldText = 64 * 1024;

// Entity expansion is checked once a document's output passes this many bytes, and
// refused where the expanded output is more than the factor times the input.
constexpr unsigned long long kAmplificationThreshold = 1024 * 1024;
constexpr float kMaxAmplification = 100.0f;

XML_Parser CreateSafeParser() {
  XML_Parser parser = XML_ParserCreateNS(nullptr, kNameSeparator);
  if (parser == nullptr) return nullptr;
  XML_SetReturnNSTriplet(parser, 1);
  // External entities and external DTD subsets are never read: no external entity handler
  // is installed, and parameter entities are not parsed.
  const bool safe = XML_SetParamEntityParsing(parser, XML_PARAM_ENTITY_PARSING_NEVER) != 0 &&
                    XML_SetBillionLaughsAttackProtectionMaximumAmplification(
                        parser, kMaxAmplification) == XML_TRUE &&
                    XML_SetBillionLaughsAttackProtectionActivationThreshold(
                        parser, kAmplificationThreshold) == XML_TRUE;
  if (!safe) {
    XML_ParserFree(parser);
    return nullptr;
  }
  return parser;
}

}  // namespace

ExpatSession::ExpatSession(AbstractParseHandler& handler)
    : handler_(handler), parser_(CreateSafeParser()), names_(kNameSeparator) {
  if (parser_ == nullptr) return;
  XML_SetUserData(parser_, this);
  XML_SetElementHandler(parser_, &OnStartElement, &OnEndElement);
  XML_SetCharacterDataHandler(parser_, &OnCharacters);
  XML_SetCommentHandler(parser_, &OnComment);
  XML_SetCdataSectionHandler(parser_, &OnStartCData, &OnEndCData);
  XML_SetProcessingInstructionHandler(parser_, &OnProcessingInstruction);
  XML_SetNamespaceDeclHandler(parser_, &OnStartNamespace, &OnEndNamespace);
}

ExpatSession::~ExpatSession() {
  if (parser_ != nullptr) XML_ParserFree(parser_);
}

bool ExpatSession::Feed(const char* bytes, std::size_t size, bool last) {
  return AfterParse(XML_Parse(parser_, bytes, static_cast<int>(size), last ? 1 : 0));
}

void* ExpatSession::Buffer(std::size_t capacity) {
  return XML_GetBuffer(parser_, static_cast<int>(capacity));
}

bool ExpatSession::FeedBuffer(std::size_t size, bool last) {
  return AfterParse(XML_ParseBuffer(parser_, static_cast<int>(size), last ? 1 : 0));
}

bool ExpatSession::AfterParse(int status) {
  return status == XML_STATUS_OK && handlerFailure_ == nullptr;
}

void ExpatSession::Finish(bool parsed) {
  if (handlerFailure_ != nullptr) std::rethrow_exception(std::exchange(handlerFailure_, {}));
  // Text read before a fault was good text, as it would have been had it come in pieces.
  FlushText();
  if (parsed) handler_.EndDocument();
}

template <class Event>
void ExpatSession::Deliver(void* self, Event&& event) {
  auto& session = *static_cast<ExpatSession*>(self);
  // Expat may still report an event or two after being stopped.
  if (session.handlerFailure_ != nullptr) return;
  try {
    std::forward<Event>(event)(session);
  } catch (...) {
    session.handlerFailure_ = std::current_exception();
    XML_StopParser(session.parser_, XML_FALSE);
  }
}

void ExpatSession::OnStartElement(void* self, const char* name, const char** attributes) {
  Deliver(self, [name, attributes](ExpatSession& s) {
    s.FlushText();
    // Expat lists the attributes as name, value pairs in document order, then the
    // defaults from the DTD.
    std::size_t count = 0;
    while (attributes[2 * count] != nullptr) ++count;
    s.attributes_.resize(count);
    for (std::size_t i = 0; i < count; ++i) {
      Attribute& attribute = s.attributes_[i];
      const SplitName& parts = s.names_.Split(attributes[2 * i]);
      attribute.qualifiedName = parts.qualifiedName;
      attribute.namespaceURI = parts.namespaceURI;
      attribute.localName = parts.localName;
      const char* value = attributes[2 * i + 1];
      s.AssignUTF16(value, std::strlen(value), attribute.value);
    }
    const SplitName& element = s.names_.Split(name);
    s.openElements_.push_back(s.names_.IsLasting(element) ? &element : nullptr);
    s.handler_.StartElementWithNamespace(element.qualifiedName, element.namespaceURI,
                                         element.localName, s.attributes_);
  });
}

void ExpatSession::OnEndElement(void* self, const char* name) {
  Deliver(self, [name](ExpatSession& s) {
    s.FlushText();
    const SplitName* open = nullptr;
    if (!s.openElements_.empty()) {
      open = s.openElements_.back();
      s.openElements_.pop_back();
    }
    const SplitName& element = open != nullptr ? *open : s.names_.Split(name);
    s.handler_.EndElementWithNamespace(element.qualifiedName, element.namespaceURI,
                                       element.localName);
  });
}

void ExpatSession::OnCharacters(void* self, const char* text, int length) {
  Deliver(self, [text, length](ExpatSession& s) {
    s.pendingText_.append(reinterpret_cast<const unsigned char*>(text),
                          static_cast<std::size_t>(length));
    // Expat splits only between characters, so a piece never cuts a character in two.
    if (s.pendingText_.size() >= kMaxHeldText) s.FlushText();
  });
}

void ExpatSession::OnComment(void* self, const char* text) {
  Deliver(self, [text](ExpatSession& s) {
    s.FlushText();
    s.handler_.Comment(s.ToUTF16(text));
  });
}

void ExpatSession::OnStartCData(void* self) {
  Deliver(self, [](ExpatSession& s) {
    s.FlushText();
    s.handler_.StartCDATA();
  });
}

void ExpatSession::OnEndCData(void* self) {
  Deliver(self, [](ExpatSession& s) {
    s.FlushText();
    s.handler_.EndCDATA();
  });
}

// Not an event of its own, but markup: the text on either side stays apart.
void ExpatSession::OnProcessingInstruction(void* self, const char*, const char*) {
  Deliver(self, [](ExpatSession& s) { s.FlushText(); });
}

void ExpatSession::OnStartNamespace(void* self, const char* prefix, const char* uri) {
  Deliver(self, [prefix, uri](ExpatSession& s) {
    s.FlushText();
    s.handler_.StartPrefixMapping(s.ToUTF16(prefix), s.ToUTF16(uri));
  });
}

void ExpatSession::OnEndNamespace(void* self, const char* prefix) {
  Deliver(self, [prefix](ExpatSession& s) {
    s.FlushText();
    s.handler_.EndPrefixMapping(s.ToUTF16(prefix));
  });
}

void ExpatSession::FlushText() {
  if (pendingText_.empty()) return;
  AssignUTF16(reinterpret_cast<const char*>(pendingText_.data()), pendingText_.size(), text_);
  pendingText_.clear();
  handler_.Characters(text_);
}

void ExpatSession::AssignUTF16(const char* text, std::size_t length, UTF16String& out) {
  // Most text of most documents is 7-bit: widen it in place.
  const auto* bytes = reinterpret_cast<const unsigned char*>(text);
  unsigned char high = 0;
  for (std::size_t i = 0; i < length; ++i) high |= bytes[i];
  if (high < 0x80) {
    out.resize(length);
    UTF16Char* units = out.data();
    for (std::size_t i = 0; i < length; ++i) units[i] = static_cast<UTF16Char>(bytes[i]);
    return;
  }
  scratch_.assign(bytes, length);
  out = utility::UTF8to16(scratch_);
}

UTF16String ExpatSession::ToUTF16(const char* text, std::size_t length) {
  scratch_.assign(reinterpret_cast<const unsigned char*>(text), length);
  return utility::UTF8to16(scratch_);
}

// Expat passes null for an absent prefix or URI; both mean empty.
UTF16String ExpatSession::ToUTF16(const char* text) {
  return text == nullptr ? UTF16String() : ToUTF16(text, std::strlen(text));
}

}  // namespace kelcore::xml
