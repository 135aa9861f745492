// One parse run over Expat: creates and configures the Expat parser, turns its callbacks
// into AbstractParseHandler events and frees the parser when destroyed. Used by one
// thread; the Expat parser never outlives the session.
#pragma once

#include <cstddef>
#include <exception>
#include <vector>

#include <kelcore/utility/StringTypes.h>
#include <kelcore/xml/AbstractParseHandler.h>
#include <kelcore/xml/Attribute.h>

#include "xml/ExpatNames.h"

struct XML_ParserStruct;

namespace kelcore::xml {

class ExpatSession {
 public:
  explicit ExpatSession(AbstractParseHandler& handler);
  ~ExpatSession();
  ExpatSession(const ExpatSession&) = delete;
  ExpatSession& operator=(const ExpatSession&) = delete;

  // Whether the Expat parser was created and every safety setting took. When false,
  // nothing else may be called.
  bool Ready() const { return parser_ != nullptr; }

  // Parses `size` bytes of `bytes` (at most INT_MAX); `last` marks the end of the
  // document. False once the document failed or a handler threw; then nothing more may
  // be fed.
  bool Feed(const char* bytes, std::size_t size, bool last);

  // The same through Expat's own buffer, which saves a copy: Buffer gives room for up to
  // `capacity` bytes (null when out of memory), FeedBuffer parses the first `size` of them.
  void* Buffer(std::size_t capacity);
  bool FeedBuffer(std::size_t size, bool last);

  // Ends the run: rethrows what a handler threw inside Expat; otherwise delivers the text
  // still held back and, when `parsed`, EndDocument. Exceptions of the handler pass.
  void Finish(bool parsed);

 private:
  static void OnStartElement(void* self, const char* name, const char** attributes);
  static void OnEndElement(void* self, const char* name);
  static void OnCharacters(void* self, const char* text, int length);
  static void OnComment(void* self, const char* text);
  static void OnStartCData(void* self);
  static void OnEndCData(void* self);
  static void OnProcessingInstruction(void* self, const char* target, const char* data);
  static void OnStartNamespace(void* self, const char* prefix, const char* uri);
  static void OnEndNamespace(void* self, const char* prefix);

  // Runs one event for the handler unless an earlier one threw; an exception stops Expat
  // and is kept for Finish, so that it never crosses Expat's C frames.
  template <class Event>
  static void Deliver(void* self, Event&& event);

  bool AfterParse(int status);
  void FlushText();
  UTF16String ToUTF16(const char* text, std::size_t length);
  UTF16String ToUTF16(const char* text);
  // Replaces `out` with `length` bytes of UTF-8 `text` in UTF-16, as UTF8to16 converts
  // them, keeping `out`'s capacity.
  void AssignUTF16(const char* text, std::size_t length, UTF16String& out);

  AbstractParseHandler& handler_;
  XML_ParserStruct* parser_ = nullptr;
  std::exception_ptr handlerFailure_;
  UTF8String pendingText_;  // adjacent character data not yet delivered
  UTF16String text_;        // the text delivered last, kept for its capacity
  UTF8String scratch_;      // reused for conversions
  // The names of the open elements, innermost last, so that an element's end needs no
  // second look-up; null for a name that ExpatNames does not keep.
  std::vector<const SplitName*> openElements_;
  ExpatNames names_;
  // Reused from element to element, so that the strings keep their capacity.
  AttributeVector attributes_;
};

}  // namespace kelcore::xml
