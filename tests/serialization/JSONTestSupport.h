// Helpers shared by the JSON tests.
#pragma once

#include <kelcore/serialization/JSONParse.h>
#include <kelcore/serialization/JSONValue.h>
#include <kelcore/serialization/JSONWriter.h>

#include <string>

namespace kelcore::serialization::testing {

inline UTF8String U8(const std::string& text) {
  return UTF8String(text.begin(), text.end());
}
inline std::string Narrow(const UTF8String& text) {
  return std::string(text.begin(), text.end());
}

inline JSONValue Parse(const std::string& text) {
  return JSONParse(reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

inline std::string Write(const boost::any& value) {
  return Narrow(GetJSONUTF8String(value));
}

// Parses and writes back: the canonical form of a text.
inline std::string Rewrite(const std::string& text) {
  return Write(*Parse(text));
}

// The message of the std::runtime_error that parsing `text` raises, or "" if none.
inline std::string ParseError(const std::string& text) {
  try {
    Parse(text);
  } catch (const std::runtime_error& error) {
    return error.what();
  }
  return "";
}

}  // namespace kelcore::serialization::testing
