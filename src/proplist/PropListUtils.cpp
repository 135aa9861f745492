#include <kelcore/proplist/PropListUtils.h>

#include <kelcore/config/Errors.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>
#include <kelcore/filesupport/SafeSave.h>
#include <kelcore/proplist/PropListXMLHandler.h>
#include <kelcore/utility/UnicodeConversion.h>
#include <kelcore/xml/ParserFactorySlot.h>

#include <memory>
#include <string>
#include <string_view>

namespace kelcore::proplist::utils {
namespace {

constexpr unsigned long kPropListComponent = 104;

constexpr const char* kMissingParserFactoryLoad =
    "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryLoad=Missing XML Parser Factory "
    "in LoadPropList.";
constexpr const char* kParsingCorruptRename =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListCorruptRename=Error parsing "
    "properties list from file \"^1\". It has been renamed to \"^2\" for backup. Proceeding.";
constexpr const char* kParsingLoad =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListLoad=Error parsing properties "
    "list from file \"^1\".";
constexpr const char* kMissingParserFactoryRead =
    "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryRead=Missing XML Parser Factory "
    "in ReadPropList.";
constexpr const char* kParsingRead =
    "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListRead=Error parsing properties "
    "list from memory.";

enum ErrorNumber : long {
  kMissingParserFactoryLoadError = 2,
  kParsingCorruptRenameError = 3,
  kParsingLoadError = 4,
  kMissingParserFactoryReadError = 5,
  kParsingReadError = 6,
};

void Raise(const char* key, long number, const config::ReplacementValue& value1 = {},
           const config::ReplacementValue& value2 = {}) {
  config::ThrowError(config::kErrorLevelNonFatal, key, kPropListComponent, number, true, value1,
                     value2);
}

std::unique_ptr<xml::AbstractDocParser> ParserFor(PropList& list) {
  std::unique_ptr<xml::AbstractParseHandler> handler = std::make_unique<PropListXMLHandler>(list);
  return xml::GetParser(std::move(handler));
}

void Append(std::string_view text, UTF8String& out) {
  out.append(reinterpret_cast<const unsigned char*>(text.data()), text.size());
}

// Renames the corrupt `file` to its name plus ".old", replacing an older backup; the
// backup's name, or nothing when a file error got in the way.
bool RenameToBackup(filesupport::File file, UTF16String& backupName) {
  backupName = file.GetName() + utility::AsciiToUTF16(".old", 4);
  try {
    filesupport::File backup(file.Parent(), backupName);
    if (backup.Exists()) backup.Delete();
    file.Rename(backupName);
    return true;
  } catch (const filesupport::file_exception&) {
    return false;
  }
}

}  // namespace

void LoadPropList(const UTF16String& path, PropList& list, bool renameIfCorrupt) {
  const std::unique_ptr<xml::AbstractDocParser> parser = ParserFor(list);
  if (parser == nullptr) return Raise(kMissingParserFactoryLoad, kMissingParserFactoryLoadError);
  xml::XMLParseStatus status;
  try {
    status = parser->ParseDocument(path);
  } catch (const PropListVersionRefused&) {
    list.Clear();  // the error has been reported (deferred)
    return;
  } catch (...) {
    list.Clear();
    throw;
  }
  if (status == xml::kXMLParseSuccess) return;
  list.Clear();
  const filesupport::File file(path);
  UTF16String backupName;
  if (renameIfCorrupt && file.Exists() && RenameToBackup(file, backupName)) {
    return Raise(kParsingCorruptRename, kParsingCorruptRenameError, path, backupName);
  }
  Raise(kParsingLoad, kParsingLoadError, path);
}

void ReadPropList(const UTF8String& bytes, PropList& list) {
  const std::unique_ptr<xml::AbstractDocParser> parser = ParserFor(list);
  if (parser == nullptr) return Raise(kMissingParserFactoryRead, kMissingParserFactoryReadError);
  try {
    if (parser->ParseBuffer(bytes) != xml::kXMLParseSuccess) {
      Raise(kParsingRead, kParsingReadError);
    }
  } catch (const PropListVersionRefused&) {
    // Reported already, and deferred by the error manager.
  }
}

void WritePropList(UTF8String& out, const PropList& list) {
  out.clear();
  Append("<?xml version='1.0'?>\n<prop.map version='", out);
  Append(std::to_string(list.GetVersion()), out);
  Append("'>\n", out);
  list.OutputAsXMLFragment(out);
  Append("</prop.map>\n", out);
}

void SavePropList(const filesupport::File& file, const PropList& list) {
  UTF8String document;
  WritePropList(document, list);
  filesupport::SafeSave save(file);
  utility::FileUtils::SimpleWriteStringToFile(save.GetTempFile(), document);
  save.Commit();
}

void SavePropList(const UTF16String& path, const PropList& list) {
  SavePropList(filesupport::File(path), list);
}

}  // namespace kelcore::proplist::utils
