#include <kelcore/filesupport/SafeSave.h>

#include <kelcore/filesupport/Dir.h>
#include <kelcore/filesupport/FileExceptions.h>
#include <kelcore/filesupport/FileUtils.h>

#include <string>

#include "filesupport/PathEncoding.h"

#if defined(_WIN32)
#include "win/SafeSaveCommit.inc"
#else
#include "posix/SafeSaveCommit.inc"
#endif

namespace kelcore::filesupport {
namespace {

UTF16String Decimal(long long value) {
  const std::string text = std::to_string(value);
  return UTF16String(text.begin(), text.end());
}

}  // namespace

SafeSave::SafeSave(const File& target) : target_(FinalLinkTarget(target.FullPath())) {
  const UTF16String dot(1, static_cast<UTF16Char>('.'));
  const UTF16String base =
      target_.GetTitle() + dot + Decimal(CurrentProcessId()) + dot + Decimal(CurrentThreadId());
  // A bare relative name lies in the current directory.
  UTF16String directory = target_.Parent().FullPath();
  if (directory.empty()) directory = dot;
  temp_ = File(utility::FileUtils::UniqueFileName(directory, base, target_.GetExtension(true)));
}

SafeSave::~SafeSave() {
  try {
    if (temp_.FullPath() != target_.FullPath() && temp_.Exists()) temp_.Delete();
  } catch (...) {
    // Leaving a stray temporary file behind is the lesser harm.
  }
}

void SafeSave::Commit() {
  const std::string temporary = temp_.FullPathMultiByte();
  switch (DurableReplace(temporary, target_.FullPathMultiByte())) {
    case CommitStep::kDone:
      temp_ = target_;
      return;
    case CommitStep::kOpenTemporary:
    case CommitStep::kRename:
      throw rename_file(temp_, target_.GetName());
    case CommitStep::kFlushTemporary:
      throw file_exception(temp_);
    case CommitStep::kFlushDirectory:
      temp_ = target_;
      throw file_exception(target_);
  }
}

}  // namespace kelcore::filesupport
