// Loading, reading, writing and saving whole property lists in their XML file format.
//
// The document, exactly as written (every line ends in one line feed, no indentation):
//   <?xml version='1.0'?>
//   <prop.map version='4'>            the list's own version, in decimal
//   <prop.list>                       the list's fragment (PropList::OutputAsXMLFragment):
//   <prop.pair>                       one pair per entry, in key order
//   <key>name</key>
//   <int type='signed' size='32'>7</int>
//   </prop.pair>
//   </prop.list>
//   </prop.map>
// Reading is PropListXMLHandler's (see there for its leniency).
//
// Errors are raised through kelcore::config::ThrowError (so an error manager must be
// installed), all non-fatal, component 104, deferral allowed; when the manager defers an
// error the function returns normally:
//   error 1  "$$$/kelcore/proplist/Error/PropListXMLHandler/VersionGreaterThan=..." (the
//            document's version is above 4)
//   error 2  "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryLoad=..."
//   error 3  "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListCorruptRename=..."
//            ^1 the path passed, ^2 the backup's name (the file's name + ".old")
//   error 4  "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListLoad=..."
//            ^1 the path passed
//   error 5  "$$$/kelcore/proplist/Error/PropListUtils/MissingParserFactoryRead=..."
//   error 6  "$$$/kelcore/proplist/Error/PropListUtils/ParsingPropertiesListRead=..."
// An XML parser factory must be installed first (kelcore::xml::SetParserFactory).
//
// Threads: the functions are reentrant; the list passed must not be used by another
// thread during the call.
#pragma once

#include <kelcore/Export.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/proplist/PropList.h>
#include <kelcore/utility/StringTypes.h>

namespace kelcore::proplist::utils {

// Reads the document in the file at `path` into `list`, adding to what it holds and
// setting its version from the document. When the file cannot be read or parsed (a
// missing file included), the list is cleared and an error raised: with
// `renameIfCorrupt` and an existing file, the file is first renamed to its name plus
// ".old" in the same directory (an older backup of that name is deleted) and error 3
// names both; otherwise, or when deleting or renaming fails, error 4. A version above 4
// clears the list and raises error 1. Any other exception (from the error manager, or
// std::bad_alloc) also leaves the list cleared.
KELCORE_API void LoadPropList(const UTF16String& path, PropList& list, bool renameIfCorrupt);

// Reads the document held in `bytes` into `list`. On a failed parse raises error 6; the
// list keeps whatever was read before the failure.
KELCORE_API void ReadPropList(const UTF8String& bytes, PropList& list);

// Replaces `out` with the document of `list`.
KELCORE_API void WritePropList(UTF8String& out, const PropList& list);

// Writes the document of `list` to `file` through SafeSave: the file holds either its
// old content or the whole new document at every instant (see
// <kelcore/filesupport/SafeSave.h>). Failures throw the file exceptions of SafeSave and
// SimpleWriteStringToFile (a missing directory dir_not_found_exception, an unwritable
// one create_accessdenied_exception, ...); the file is then unchanged.
KELCORE_API void SavePropList(const filesupport::File& file, const PropList& list);
KELCORE_API void SavePropList(const UTF16String& path, const PropList& list);

}  // namespace kelcore::proplist::utils
