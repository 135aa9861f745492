#include "HostSession.h"

#include <kelcore/config/ClientIdentity.h>
#include <kelcore/config/ErrorManager.h>
#include <kelcore/config/Localizer.h>
#include <kelcore/console/ConsoleCommands.h>
#include <kelcore/debug/Trace.h>
#include <kelcore/logging/ConsoleLogFile.h>
#include <kelcore/utility/UnicodeConversion.h>
#include <kelcore/xml/DefaultParserFactory.h>
#include <kelcore/xml/ParserFactorySlot.h>

#include "DataCommands.h"
#include "HostCommands.h"

namespace kelcon {

namespace {

kelcore::UTF16String Wide(const char* text) {
  return kelcore::utility::UTF8to16(kelcore::UTF8String(kelcore::utility::AsciiToUTF8Impl(text)));
}

}  // namespace

HostSession::HostSession(const HostOptions& options) {
  using namespace kelcore;
  config::Localizer::Set(&localizer_);
  config::ErrorManager::Set(&errorManager_);

  config::SetCompanyName(Wide("Varden"));
  config::SetClientName(Wide("kelcon"));
  config::SetApplicationName(Wide("kelcon"));
  config::SetClientVersion(Wide("2.0"));
  config::SetClientInternalVersion(Wide("2.0"));
  if (!options.prefsDir.empty()) config::SetClientPrefsDir(options.prefsDir);

  mainThread_ = threads::RegisterCurrentThreadAsMainThread();
  xml::SetParserFactory(xml::CreateDefaultParserFactory());

  console::Initialize();
  RegisterHostCommands();
  RegisterDataCommands();

  if (options.openLogFile) console::ConsoleLogFile::GetInstance().OpenDefaultLogFile(true);
  traceHandlers_.emplace();
}

HostSession::~HostSession() {
  using namespace kelcore;
  traceHandlers_.reset();
  debug::ShutdownTraceManager();
  console::ConsoleLogFile::Terminate();
  UnregisterDataCommands();
  UnregisterHostCommands();
  console::Terminate();
  xml::SetParserFactory(nullptr);
  mainThread_.reset();
  config::ErrorManager::Set(nullptr);
  config::Localizer::Set(nullptr);
}

}  // namespace kelcon
