#include "DataCommands.h"

#include <kelcore/console/Command.h>
#include <kelcore/debug/CodeProfiler.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/serialization/JSONParse.h>
#include <kelcore/serialization/JSONValue.h>
#include <kelcore/serialization/JSONWriter.h>
#include <kelcore/utility/Guid.h>

#include <cstdint>
#include <stdexcept>
#include <string>

#include "CommandTable.h"
#include "CommandText.h"

namespace kelcon {

namespace {

using kelcore::UTF16String;
using kelcore::UTF8String;
using kelcore::console::Command;
using kelcore::console::UTF16OutputStream;
namespace json = kelcore::serialization;

json::JSONValue ParseFile(const UTF16String& arguments, const char* usage) {
  const UTF16String path = TrimSpaces(arguments);
  if (path.empty()) throw std::invalid_argument(usage);
  UTF8String text;
  kelcore::utility::FileUtils::SimpleReadFileToString(kelcore::filesupport::File(path), text);
  return json::JSONParse(text);
}

// One line describing what `value` holds.
std::string DescribeShape(const boost::any& value) {
  if (const auto* object = boost::any_cast<json::JSONObject>(&value)) {
    return "an object with " + std::to_string(object->size()) + " members";
  }
  if (const auto* array = boost::any_cast<json::JSONArray>(&value)) {
    return "an array of " + std::to_string(array->size()) + " elements";
  }
  if (const auto* text = boost::any_cast<UTF8String>(&value)) {
    return "a string of " + std::to_string(text->size()) + " bytes";
  }
  if (boost::any_cast<std::uint64_t>(&value) || boost::any_cast<std::int64_t>(&value)) {
    return "an integer";
  }
  if (boost::any_cast<double>(&value)) return "a number with a fraction or exponent";
  if (boost::any_cast<bool>(&value)) return "a boolean";
  if (boost::any_cast<json::NullType>(&value)) return "null";
  return "nothing";
}

class JsonCheck : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, UTF16OutputStream& out) override {
    const json::JSONValue value = ParseFile(arguments, "usage: json.check FILE");
    out << "valid JSON: " << DescribeShape(value ? *value : boost::any()) << kelcore::console::endl;
  }
};

class JsonFormat : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, UTF16OutputStream& out) override {
    const json::JSONValue value = ParseFile(arguments, "usage: json.format FILE");
    out << json::GetJSONUTF8String(value ? *value : boost::any()) << kelcore::console::endl;
  }
};

class GuidNew : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String&, UTF16OutputStream& out) override {
    out << kelcore::utility::Guid::CreateUnique().AsString() << kelcore::console::endl;
  }
};

class ProfileDump : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String&, UTF16OutputStream& out) override {
    bool any = false;
    kelcore::debug::CodeProfilerManager::Get().DumpProfilingData([&](const std::string& line) {
      out << line << kelcore::console::endl;
      any = true;
    });
    if (!any) out << "No profiling data." << kelcore::console::endl;
  }
};

const CommandEntry kDataCommands[] = {
    {"json.check", "json.check <file> - parses a JSON file and reports its shape or the error.",
     &MakeCommand<JsonCheck>},
    {"json.format", "json.format <file> - prints a JSON file in compact form.",
     &MakeCommand<JsonFormat>},
    {"guid.new", "guid.new - prints a new unique GUID.", &MakeCommand<GuidNew>},
    {"profile.dump", "profile.dump - prints the code profiler's data, one line per profile.",
     &MakeCommand<ProfileDump>},
};

}  // namespace

void RegisterDataCommands() {
  RegisterCommands(kDataCommands);
}

void UnregisterDataCommands() {
  UnregisterCommands(kDataCommands);
}

}  // namespace kelcon
