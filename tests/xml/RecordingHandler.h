// A handler that writes every event it receives as one line of UTF-8 text, for tests
// that compare whole event sequences:
//   "startdoc", "enddoc"
//   "<qname|uri|local" + " qname|uri|local=value" per attribute, "</qname|uri|local"
//   "t:" + text, "!" + comment, "[cdata", "]cdata", "+prefix=uri", "-prefix"
#pragma once

#include <string>
#include <vector>

#include <kelcore/utility/UnicodeConversion.h>
#include <kelcore/xml/AbstractParseHandler.h>

namespace kelcore::xml::test_support {

inline std::string Narrow(const UTF16String& text) {
  const UTF8String bytes = utility::UTF16to8(text);
  return std::string(bytes.begin(), bytes.end());
}

inline UTF16String Wide(const std::string& text) {
  return utility::UTF8to16(UTF8String(text.begin(), text.end()));
}

inline UTF8String Bytes(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}

class RecordingHandler : public AbstractParseHandler {
 public:
  explicit RecordingHandler(std::vector<std::string>* events) : events_(events) {}

  void StartDocument() override { events_->push_back("startdoc"); }
  void EndDocument() override { events_->push_back("enddoc"); }
  void StartElementWithNamespace(const UTF16String& qualifiedName, const UTF16String& namespaceURI,
                                 const UTF16String& localName,
                                 const AttributeVector& attributes) override {
    std::string line = "<" + Name(qualifiedName, namespaceURI, localName);
    for (const Attribute& a : attributes) {
      line += " " + Name(a.qualifiedName, a.namespaceURI, a.localName) + "=" + Narrow(a.value);
    }
    events_->push_back(line);
  }
  void EndElementWithNamespace(const UTF16String& qualifiedName, const UTF16String& namespaceURI,
                               const UTF16String& localName) override {
    events_->push_back("</" + Name(qualifiedName, namespaceURI, localName));
  }
  void Characters(const UTF16String& text) override { events_->push_back("t:" + Narrow(text)); }
  void Comment(const UTF16String& text) override { events_->push_back("!" + Narrow(text)); }
  void StartCDATA() override { events_->push_back("[cdata"); }
  void EndCDATA() override { events_->push_back("]cdata"); }
  void StartPrefixMapping(const UTF16String& prefix, const UTF16String& uri) override {
    events_->push_back("+" + Narrow(prefix) + "=" + Narrow(uri));
  }
  void EndPrefixMapping(const UTF16String& prefix) override {
    events_->push_back("-" + Narrow(prefix));
  }

 private:
  static std::string Name(const UTF16String& q, const UTF16String& uri, const UTF16String& l) {
    return Narrow(q) + "|" + Narrow(uri) + "|" + Narrow(l);
  }

  std::vector<std::string>* events_;
};

}  // namespace kelcore::xml::test_support
