#include <kelcore/config/ClientIdentity.h>

#include "config/AsciiText.h"
#include "config/ClientPlatform.h"

namespace kelcore::config {
namespace {

constexpr const char* kSuiteLabelUnset = "VS";   // the suite version when none was set
constexpr const char* kSuiteLabelPrefix = "VS";  // removed from the front of a set one
constexpr const char* kLibraryVersion = "2.0.0";
constexpr const char* kLibraryBuildNumber = "420171";

struct IdentityValue {
  UTF16String value;
  bool set = false;

  void Set(const UTF16String& newValue) {
    if (&newValue != &value) value = newValue;
    set = true;
  }
};

struct Identity {
  IdentityValue clientName;
  IdentityValue applicationName;
  IdentityValue clientVersion;
  IdentityValue clientInternalVersion;
  IdentityValue clientBuildNumber;
  IdentityValue companyName;
  IdentityValue clientPrefsDir;
  IdentityValue suiteVersion;
};

Identity& TheIdentity() {
  static Identity identity;
  return identity;
}

}  // namespace

void SetClientName(const UTF16String& value) {
  TheIdentity().clientName.Set(value);
}
void SetApplicationName(const UTF16String& value) {
  TheIdentity().applicationName.Set(value);
}
void SetClientVersion(const UTF16String& value) {
  TheIdentity().clientVersion.Set(value);
}
void SetClientInternalVersion(const UTF16String& value) {
  TheIdentity().clientInternalVersion.Set(value);
}
void SetClientBuildNumber(const UTF16String& value) {
  TheIdentity().clientBuildNumber.Set(value);
}
void SetCompanyName(const UTF16String& value) {
  TheIdentity().companyName.Set(value);
}
void SetClientPrefsDir(const UTF16String& value) {
  TheIdentity().clientPrefsDir.Set(value);
}
void SetClientSuiteVersion(const UTF16String& value) {
  TheIdentity().suiteVersion.Set(value);
}

const UTF16String& GetClientName() {
  return TheIdentity().clientName.value;
}
const UTF16String& GetApplicationName() {
  const Identity& identity = TheIdentity();
  return identity.applicationName.set ? identity.applicationName.value : identity.clientName.value;
}
const UTF16String& GetClientVersion() {
  return TheIdentity().clientVersion.value;
}
const UTF16String& GetClientInternalVersion() {
  return TheIdentity().clientInternalVersion.value;
}
const UTF16String& GetClientBuildNumber() {
  return TheIdentity().clientBuildNumber.value;
}
const UTF16String& GetCompanyName() {
  return TheIdentity().companyName.value;
}
const UTF16String& GetClientPrefsDir() {
  return TheIdentity().clientPrefsDir.value;
}

bool IsClientNameInitialized() {
  return TheIdentity().clientName.set;
}

UTF16String GetClientPlatform() {
  return ReadClientPlatform();
}

UTF16String GetSuiteClientVersion() {
  const IdentityValue& suite = TheIdentity().suiteVersion;
  return suite.set ? suite.value : AsciiText(kSuiteLabelUnset);
}

UTF16String GetSuiteClientVersion_NumberOnly() {
  const Identity& identity = TheIdentity();
  if (!identity.suiteVersion.set) return identity.clientVersion.value;
  UTF16String number = identity.suiteVersion.value;
  const UTF16String prefix = AsciiText(kSuiteLabelPrefix);
  if (number.compare(0, prefix.size(), prefix) == 0) number.erase(0, prefix.size());
  if (number.find('.') == UTF16String::npos) number += AsciiText(".0");
  return number;
}

UTF16String GetSuiteClientName() {
  const Identity& identity = TheIdentity();
  const UTF16String space(1, ' ');
  return identity.companyName.value + space + identity.clientName.value + space +
         GetSuiteClientVersion() + space + AsciiText("(") + GetClientPlatform() + AsciiText(")");
}

UTF16String GetVersionString() {
  return AsciiText(kLibraryVersion) + AsciiText(".") + AsciiText(kLibraryBuildNumber);
}

void ResetClientIdentity() {
  TheIdentity() = Identity();
}

}  // namespace kelcore::config
