#include "console/DebugCommands.h"

#include <kelcore/debug/DebugDatabase.h>
#include <kelcore/utility/UnicodeConversion.h>

#include "console/CommandArguments.h"

#include <list>

namespace kelcore::commands::debug {

using console::endl;
using console::UTF16OutputStream;
using Database = kelcore::debug::DebugDatabase;

void Get::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const UTF16String path = TrimSpaces(arguments);
  if (path.empty()) {
    out << GetHelp() << endl;
    return;
  }
  const UTF8String key = utility::UTF16to8(path);
  Database& database = Database::Instance();
  if (database.HasEntry(key)) {
    out << path << " = " << database.GetEntry(key) << endl;
  } else {
    out << path << " is not in the debug database." << endl;
  }
}

void List::Execute(const UTF16String&, UTF16OutputStream& out) {
  Database& database = Database::Instance();
  std::list<UTF8String> keys;
  database.GetDebugKeys(keys);
  out << "Debug Database:" << endl;
  for (const UTF8String& key : keys) out << key << " = " << database.GetEntry(key) << endl;
}

void Set::Execute(const UTF16String& arguments, UTF16OutputStream& out) {
  const std::size_t equals = arguments.find(UTF16Char('='));
  const UTF16String path =
      equals == UTF16String::npos ? UTF16String() : TrimSpaces(arguments.substr(0, equals));
  if (path.empty()) {
    out << GetHelp() << endl;
    return;
  }
  const UTF16String value = TrimSpaces(arguments.substr(equals + 1));
  Database& database = Database::Instance();
  database.SetEntry(utility::UTF16to8(path), utility::UTF16to8(value));
  database.SaveDataBase();
  out << path << " = " << value << endl;
}

void Clear::Execute(const UTF16String&, UTF16OutputStream& out) {
  Database::Instance().Clear();
  out << "Debug database cleared." << endl;
}

}  // namespace kelcore::commands::debug
