// Compact JSON writer. The held type decides the form; containers recurse with a depth
// bound so that a cyclic or absurdly deep tree raises instead of overflowing the stack.
#include <kelcore/serialization/JSONValue.h>
#include <kelcore/serialization/JSONWriter.h>
#include <kelcore/utility/UnicodeConversion.h>

#include "JSONDouble.h"
#include "JSONText.h"

#include <charconv>
#include <cstdint>
#include <cstring>
#include <stdexcept>
#include <string>
#include <typeinfo>

namespace kelcore::serialization {
namespace {

// Bytes a string's contents need escaped (and NUL, which ends the written contents).
constexpr auto kNeedsEscape = MakeByteClass([](int c) {
  return c == 0 || c == 8 || c == 9 || c == 10 || c == 12 || c == 13 || c == '"' || c == '\\';
});

// Trees are pointer-chasing structures (element -> any -> held value), so the containers
// ask for the next elements' memory ahead of use. A boost::any is one pointer to its
// holder; reading that pointer's bytes is only a hint for the prefetch and is never
// dereferenced here.
static_assert(sizeof(boost::any) == sizeof(void*));

inline void Prefetch(const void* address) {
#if defined(__GNUC__)
  __builtin_prefetch(address);
#else
  (void)address;
#endif
}

inline void PrefetchValue(const JSONValue& value) {
  if (const boost::any* any = value.get()) {
    const void* holder;
    std::memcpy(&holder, static_cast<const void*>(any), sizeof holder);
    Prefetch(holder);
  }
}

inline void PrefetchAny(const JSONValue& value) {
  Prefetch(value.get());
}

class Writer {
 public:
  explicit Writer(UTF8String& out) : out_(out) {}

  void Write(const boost::any& value, std::size_t depth) {
    const std::type_info& type = value.type();
    // Values made inside the library share its type_info objects: try those by address
    // before comparing names.
    if (&type == &typeid(std::uint64_t)) {
      WriteInteger(*boost::unsafe_any_cast<std::uint64_t>(&value));
    } else if (&type == &typeid(UTF8String)) {
      WriteString(*boost::unsafe_any_cast<UTF8String>(&value));
    } else if (&type == &typeid(JSONObject)) {
      WriteObject(*boost::unsafe_any_cast<JSONObject>(&value), depth + 1);
    } else if (type == typeid(JSONObject)) {
      WriteObject(*boost::unsafe_any_cast<JSONObject>(&value), depth + 1);
    } else if (type == typeid(JSONArray)) {
      WriteArray(*boost::unsafe_any_cast<JSONArray>(&value), depth + 1);
    } else if (type == typeid(std::int64_t)) {
      WriteInteger(*boost::unsafe_any_cast<std::int64_t>(&value));
    } else if (type == typeid(std::uint64_t)) {
      WriteInteger(*boost::unsafe_any_cast<std::uint64_t>(&value));
    } else if (type == typeid(double)) {
      WriteDouble(*boost::unsafe_any_cast<double>(&value));
    } else if (type == typeid(UTF8String)) {
      WriteString(*boost::unsafe_any_cast<UTF8String>(&value));
    } else if (type == typeid(bool)) {
      Append(*boost::unsafe_any_cast<bool>(&value) ? "true" : "false");
    } else if (value.empty()) {
      // An empty any writes nothing.
    } else if (type == typeid(NullType)) {
      Append("null");
    } else {
      Append("<ERROR>");
    }
  }

 private:
  void Append(const char* text) {
    out_.append(reinterpret_cast<const unsigned char*>(text), std::char_traits<char>::length(text));
  }
  void Append(const char* begin, const char* end) {
    out_.append(reinterpret_cast<const unsigned char*>(begin),
                reinterpret_cast<const unsigned char*>(end));
  }

  static void CheckDepth(std::size_t depth) {
    if (depth > kMaxJSONDepth) {
      throw std::overflow_error("JSON tree nested deeper than " + std::to_string(kMaxJSONDepth) +
                                " levels, or containing itself");
    }
  }

  void WriteElement(const JSONValue& element, std::size_t depth) {
    if (element) Write(*element, depth);
  }

  void WriteObject(const JSONObject& object, std::size_t depth) {
    CheckDepth(depth);
    out_.push_back('{');
    bool first = true;
    // `far` runs four entries ahead (their any), `near` two (their held value).
    auto far = object.begin();
    auto near = object.begin();
    for (int i = 0; i < 4 && far != object.end(); ++i) PrefetchAny((far++)->second);
    for (int i = 0; i < 2 && near != object.end(); ++i) PrefetchValue((near++)->second);
    for (const auto& [key, element] : object) {
      if (far != object.end()) PrefetchAny((far++)->second);
      if (near != object.end()) PrefetchValue((near++)->second);
      if (!first) out_.push_back(',');
      first = false;
      out_.push_back('"');
      out_.append(key);
      out_.push_back('"');
      out_.push_back(':');
      WriteElement(element, depth);
    }
    out_.push_back('}');
  }

  void WriteArray(const JSONArray& array, std::size_t depth) {
    CheckDepth(depth);
    out_.push_back('[');
    const std::size_t size = array.size();
    for (std::size_t i = 0; i < size; ++i) {
      if (i + 4 < size) PrefetchAny(array[i + 4]);
      if (i + 2 < size) PrefetchValue(array[i + 2]);
      const JSONValue& element = array[i];
      if (i != 0) out_.push_back(',');
      WriteElement(element, depth);
    }
    out_.push_back(']');
  }

  template <class Integer>
  void WriteInteger(Integer value) {
    char buffer[24];
    const auto result = std::to_chars(buffer, buffer + sizeof buffer, value);
    Append(buffer, result.ptr);
  }

  // Same text as printf "%1.*lg" with precision 17.
  void WriteDouble(double value) {
    char buffer[512];
    Append(buffer, FormatJSONDouble(value, buffer, sizeof buffer));
  }

  void WriteString(const UTF8String& text) {
    out_.push_back('"');
    const unsigned char* p = text.data();
    const unsigned char* const end = p + text.size();
    while (p != end) {
      const unsigned char* run = p;
      while (p != end && !kNeedsEscape[*p]) ++p;
      out_.append(run, p);
      if (p == end || *p == 0) break;
      out_.push_back('\\');
      switch (*p) {
        case 8:
          out_.push_back('b');
          break;
        case 9:
          out_.push_back('t');
          break;
        case 10:
          out_.push_back('n');
          break;
        case 12:
          out_.push_back('f');
          break;
        case 13:
          out_.push_back('r');
          break;
        default:
          out_.push_back(*p);  // '"' or '\'
      }
      ++p;
    }
    out_.push_back('"');
  }

  UTF8String& out_;
};

}  // namespace

UTF8String GetJSONUTF8String(const boost::any& value) {
  UTF8String out;
  Writer(out).Write(value, 0);
  return out;
}

UTF16String GetJSONString(const boost::any& value) {
  return utility::UTF8to16(GetJSONUTF8String(value));
}

}  // namespace kelcore::serialization
