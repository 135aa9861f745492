#include "HostCommands.h"

#include <kelcore/console/Command.h>
#include <kelcore/console/ConsoleCommands.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/proplist/PropList.h>
#include <kelcore/proplist/PropListUtils.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <charconv>
#include <cstdint>
#include <stdexcept>
#include <string>
#include <system_error>
#include <vector>

#include "CommandTable.h"
#include "CommandText.h"

namespace kelcon {

namespace {

using kelcore::UTF16String;
using kelcore::UTF8String;
using kelcore::console::Command;
using kelcore::console::UTF16OutputStream;
using kelcore::proplist::PropList;

bool quitRequested = false;

class Help : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String&, UTF16OutputStream& out) override {
    kelcore::console::ListCommands(out);
  }
};

class Quit : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String&, UTF16OutputStream&) override { quitRequested = true; }
};

// A whole number of type T from `text`, or std::invalid_argument naming `type`.
template <typename T>
T ParseNumber(const std::string& text, const char* type) {
  T value{};
  const char* end = text.data() + text.size();
  const auto [ptr, ec] = std::from_chars(text.data(), end, value);
  if (ec != std::errc() || ptr != end || text.empty()) {
    throw std::invalid_argument("'" + text + "' is not a " + type + " value");
  }
  return value;
}

bool ParseBool(const std::string& text) {
  if (text == "true" || text == "1" || text == "yes") return true;
  if (text == "false" || text == "0" || text == "no") return false;
  throw std::invalid_argument("'" + text + "' is not a bool value (true or false)");
}

// Stores `value`, given as text, under `key` with the type named by `type`.
void SetTypedValue(PropList& list, const UTF8String& key, const std::string& type,
                   const std::string& value) {
  if (type == "ustring") {
    list.SetValue(key, kelcore::utility::UTF8to16(ToUTF8(value)));
  } else if (type == "string") {
    list.SetValue(key, ToUTF8(value));
  } else if (type == "bool") {
    list.SetValue(key, ParseBool(value));
  } else if (type == "uint16") {
    list.SetValue(key, ParseNumber<std::uint16_t>(value, "uint16"));
  } else if (type == "uint32") {
    list.SetValue(key, ParseNumber<std::uint32_t>(value, "uint32"));
  } else if (type == "int32") {
    list.SetValue(key, ParseNumber<std::int32_t>(value, "int32"));
  } else if (type == "int64") {
    list.SetValue(key, ParseNumber<std::int64_t>(value, "int64"));
  } else if (type == "uint64") {
    list.SetValue(key, ParseNumber<std::uint64_t>(value, "uint64"));
  } else if (type == "float") {
    list.SetValue(key, ParseNumber<float>(value, "float"));
  } else if (type == "double") {
    list.SetValue(key, ParseNumber<double>(value, "double"));
  } else {
    throw std::invalid_argument("unknown type '" + type +
                                "' (ustring, string, bool, uint16, uint32, int32, int64, "
                                "uint64, float, double)");
  }
}

class PlistPrint : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, UTF16OutputStream& out) override {
    const UTF16String path = TrimSpaces(arguments);
    if (path.empty()) throw std::invalid_argument("usage: plist.print FILE");
    PropList list;
    kelcore::proplist::utils::LoadPropList(path, list, false);
    UTF8String text;
    kelcore::proplist::utils::WritePropList(text, list);
    out << text;
  }
};

class PlistSet : public Command {
 public:
  using Command::Command;
  void Execute(const UTF16String& arguments, UTF16OutputStream& out) override {
    // FILE KEY TYPE take one word each; the value is the rest of the line.
    const std::vector<std::string> words = SplitWords(ToNarrow(arguments), 4);
    if (words.size() != 4) {
      throw std::invalid_argument("usage: plist.set FILE KEY TYPE VALUE");
    }
    const UTF16String path = kelcore::utility::UTF8to16(ToUTF8(words[0]));
    PropList list;
    if (kelcore::filesupport::File(path).Exists()) {
      kelcore::proplist::utils::LoadPropList(path, list, false);
    }
    SetTypedValue(list, ToUTF8(words[1]), words[2], words[3]);
    kelcore::proplist::utils::SavePropList(path, list);
    out << words[1] << " set in " << words[0] << kelcore::console::endl;
  }
};

const CommandEntry kHostCommands[] = {
    {"help", "help - lists the commands.", &MakeCommand<Help>},
    {"quit", "quit - leaves the console (Ctrl-D does the same).", &MakeCommand<Quit>},
    {"plist.print", "plist.print <file> - loads a property list and prints it as XML.",
     &MakeCommand<PlistPrint>},
    {"plist.set",
     "plist.set <file> <key> <type> <value> - sets a value in a property list file and saves "
     "it; type is ustring, string, bool, uint16, uint32, int32, int64, uint64, float or "
     "double.",
     &MakeCommand<PlistSet>},
};

}  // namespace

void RegisterHostCommands() {
  quitRequested = false;
  RegisterCommands(kHostCommands);
}

void UnregisterHostCommands() {
  UnregisterCommands(kHostCommands);
}

bool QuitRequested() {
  return quitRequested;
}

}  // namespace kelcon
