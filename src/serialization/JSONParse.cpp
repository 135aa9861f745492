// Recursive-descent JSON reader over a byte range. Every read is bounded by the range's
// end; nesting is bounded by kMaxJSONDepth so hostile text cannot exhaust the stack.
#include <kelcore/serialization/JSONParse.h>
#include <kelcore/utility/UnicodeConversion.h>

#include "JSONNumber.h"
#include "JSONText.h"

#include <cstdint>
#include <cstring>
#include <stdexcept>
#include <string>

namespace kelcore::serialization {
namespace {

[[noreturn]] void Fail(const char* message) {
  throw std::runtime_error(message);
}

class Parser {
 public:
  Parser(const unsigned char* begin, const unsigned char* end) : p_(begin), end_(end) {}

  JSONValue ParseValue() {
    SkipSpace();
    if (p_ == end_) return JSONValue();
    JSONValue value;
    switch (*p_) {
      case '"':
        value = MakeJSONValue(ParseString());
        break;
      case '[':
        value = ParseArray();
        break;
      case '{':
        value = ParseObject();
        break;
      case 't':
        ExpectLiteral("true", 4);
        value = MakeJSONValue(true);
        break;
      case 'f':
        ExpectLiteral("false", 5);
        value = MakeJSONValue(false);
        break;
      case 'n':
        ExpectLiteral("null", 4);
        value = MakeJSONValue(NullType{});
        break;
      default:
        if (*p_ == '-' || IsJSONDigit(*p_)) {
          value = ParseNumber();
          break;
        }
        Fail("ParseValue unexpected char");
    }
    SkipSpace();
    return value;
  }

 private:
  void SkipSpace() {
    while (p_ != end_ && kIsJSONSpace[*p_]) ++p_;
  }

  void ExpectLiteral(const char* literal, std::size_t length) {
    if (static_cast<std::size_t>(end_ - p_) < length || std::memcmp(p_, literal, length) != 0) {
      Fail("ParsePrimitive unexpected char");
    }
    p_ += length;
  }

  JSONValue ParseNumber() {
    const NumberScan scan = ScanJSONNumber(p_, end_);
    p_ = scan.end;
    switch (scan.kind) {
      case NumberScan::kUnsigned:
        return MakeJSONValue(scan.unsignedValue);
      case NumberScan::kSigned:
        return MakeJSONValue(scan.signedValue);
      default:
        return MakeJSONValue(scan.doubleValue);
    }
  }

  // Called on the opening quote; leaves the cursor after the closing one.
  UTF8String ParseString() {
    const unsigned char* const start = ++p_;
    const unsigned char* q = FindQuoteOrBackslash(start, end_);
    if (q != end_ && *q == '"') {
      p_ = q + 1;
      return UTF8String(start, q);
    }
    // Escapes: find the closing quote, checking the escape letters on the way.
    while (q != end_ && *q != '"') {
      if (*q == '\\') {
        if (++q == end_ || !kIsEscapeLetter[*q]) Fail("AdvanceString: unexpected char");
        ++q;
      } else {
        ++q;
      }
      q = FindQuoteOrBackslash(q, end_);
    }
    if (q == end_) Fail("AdvanceString: unexpected char");
    p_ = q + 1;
    return UnescapeJSONString(start, q);
  }

  void Enter() {
    if (++depth_ > kMaxJSONDepth) {
      throw std::overflow_error("JSON text nested deeper than " + std::to_string(kMaxJSONDepth) +
                                " levels");
    }
  }

  JSONValue ParseArray() {
    Enter();
    ++p_;
    JSONValue result = MakeJSONValue(JSONArray());
    auto& array = *boost::any_cast<JSONArray>(result.get());
    SkipSpace();
    if (p_ != end_ && *p_ == ']') {
      ++p_;
    } else {
      for (;;) {
        array.push_back(ParseValue());
        if (p_ == end_) Fail("ParseArray unexpected char");
        if (*p_ == ']') {
          ++p_;
          break;
        }
        if (*p_ != ',') Fail("ParseArray unexpected char");
        ++p_;
      }
    }
    --depth_;
    return result;
  }

  JSONValue ParseObject() {
    Enter();
    ++p_;
    JSONValue result = MakeJSONValue(JSONObject());
    auto& object = *boost::any_cast<JSONObject>(result.get());
    SkipSpace();
    if (p_ != end_ && *p_ == '}') {
      ++p_;
    } else {
      for (;;) {
        SkipSpace();
        if (p_ == end_ || *p_ != '"') Fail("ParseObject unexpected char");
        UTF8String key = ParseString();
        SkipSpace();
        if (p_ == end_ || *p_ != ':') Fail("ParseObject unexpected char");
        ++p_;
        JSONValue value = ParseValue();
        // Keys usually arrive in order; a repeated key takes the later value.
        object.insert_or_assign(object.end(), std::move(key), std::move(value));
        if (p_ == end_) Fail("ParseObject unexpected char");
        if (*p_ == '}') {
          ++p_;
          break;
        }
        if (*p_ != ',') Fail("ParseObject unexpected char");
        ++p_;
      }
    }
    --depth_;
    return result;
  }

  const unsigned char* p_;
  const unsigned char* const end_;
  std::size_t depth_ = 0;
};

}  // namespace

JSONValue JSONParse(const unsigned char* text, std::size_t count) {
  if (count == 0) return JSONValue();
  return Parser(text, text + count).ParseValue();
}

JSONValue JSONParse(const UTF8String& text) {
  return JSONParse(text.data(), text.size());
}

JSONValue JSONParse(const UTF16String& text) {
  return JSONParse(utility::UTF16to8(text));
}

JSONValue JSONParse(const unsigned char* text) {
  if (text == nullptr) return JSONValue();
  return JSONParse(text, std::strlen(reinterpret_cast<const char*>(text)));
}

}  // namespace kelcore::serialization
