#include "debug/TraceDatabaseStore.h"

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/File.h>
#include <kelcore/filesupport/FileUtils.h>

namespace kelcore::debug {

namespace {

class TraceDatabaseFile : public TraceDatabaseStore {
 public:
  UTF8String Read() override {
    UTF8String text;
    try {
      const filesupport::File file = Path();
      if (file.Exists()) utility::FileUtils::SimpleReadFileToString(file, text);
    } catch (...) {
      // No preferences directory or an unreadable file: every category has its defaults.
      text.clear();
    }
    return text;
  }

  void Write(const UTF8String& text) override {
    try {
      utility::FileUtils::SimpleWriteStringToFile(Path(), text);
    } catch (...) {
    }
  }

 private:
  static filesupport::File Path() {
    return filesupport::File(filesupport::Dir::PrefDir(), u"Trace Database.txt");
  }
};

}  // namespace

std::unique_ptr<TraceDatabaseStore> MakeTraceDatabaseFileStore() {
  return std::make_unique<TraceDatabaseFile>();
}

}  // namespace kelcore::debug
