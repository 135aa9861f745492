#include "filesupport/XdgDirs.h"

namespace kelcore::filesupport::detail {

namespace {

bool IsAbsolute(std::string_view path) {
  return !path.empty() && path.front() == '/';
}

std::string UnderHome(const XdgEnvironment& env, std::string_view relative) {
  if (env.home.empty()) return {};
  std::string path = env.home;
  path += '/';
  path += relative;
  return path;
}

bool IsBlank(char c) {
  return c == ' ' || c == '\t';
}

std::string_view SkipBlanks(std::string_view text) {
  while (!text.empty() && IsBlank(text.front())) text.remove_prefix(1);
  return text;
}

bool ConsumePrefix(std::string_view& text, std::string_view prefix) {
  if (text.substr(0, prefix.size()) != prefix) return false;
  text.remove_prefix(prefix.size());
  return true;
}

// The value at the start of `text` with its quoting removed; nullopt for a quote that is
// never closed.
std::optional<std::string> ReadShellWord(std::string_view text) {
  const bool quoted = ConsumePrefix(text, "\"");
  std::string word;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char c = text[i];
    if (quoted ? c == '"' : (IsBlank(c) || c == '\r' || c == '#')) return word;
    if (c == '\\' && i + 1 < text.size()) {
      word += text[++i];
    } else {
      word += c;
    }
  }
  if (quoted) return std::nullopt;
  return word;
}

// The value with $HOME expanded; empty when it does not name an absolute path.
std::string ExpandUserDirValue(std::string_view value, std::string_view home) {
  for (const std::string_view variable : {std::string_view("$HOME"), std::string_view("${HOME}")}) {
    std::string_view rest = value;
    if (!ConsumePrefix(rest, variable)) continue;
    if (!rest.empty() && rest.front() != '/') break;  // "$HOMEWORK" is another variable
    if (home.empty()) return {};
    std::string path(home);
    path += rest;
    return path;
  }
  return IsAbsolute(value) ? std::string(value) : std::string();
}

}  // namespace

std::string XdgConfigHome(const XdgEnvironment& env) {
  return IsAbsolute(env.configHome) ? env.configHome : UnderHome(env, ".config");
}

std::string XdgDataHome(const XdgEnvironment& env) {
  return IsAbsolute(env.dataHome) ? env.dataHome : UnderHome(env, ".local/share");
}

std::optional<std::string> FindXdgUserDir(std::string_view fileText, std::string_view name,
                                          std::string_view home) {
  std::string variable = "XDG_";
  variable += name;
  variable += "_DIR";
  std::optional<std::string> found;
  while (!fileText.empty()) {
    const std::size_t end = fileText.find('\n');
    std::string_view line = fileText.substr(0, end);
    fileText.remove_prefix(end == std::string_view::npos ? fileText.size() : end + 1);

    line = SkipBlanks(line);
    if (!ConsumePrefix(line, variable)) continue;
    line = SkipBlanks(line);
    if (!ConsumePrefix(line, "=")) continue;
    const std::optional<std::string> value = ReadShellWord(SkipBlanks(line));
    if (!value) continue;
    std::string path = ExpandUserDirValue(*value, home);
    if (!path.empty()) found = std::move(path);
  }
  return found;
}

std::string XdgSystemFolder(SystemFolder id, const XdgEnvironment& env,
                            std::string_view userDirsText) {
  switch (id) {
    case SystemFolder::kAppData:
      return XdgConfigHome(env);
    case SystemFolder::kDocuments:
      if (auto dir = FindXdgUserDir(userDirsText, "DOCUMENTS", env.home)) return *dir;
      return UnderHome(env, "Documents");
    case SystemFolder::kDesktop:
      if (auto dir = FindXdgUserDir(userDirsText, "DESKTOP", env.home)) return *dir;
      return UnderHome(env, "Desktop");
    case SystemFolder::kProgramFiles:
      return "/opt";
    case SystemFolder::kProgramFilesCommon:
      return "/opt/common";
    case SystemFolder::kCommonDocuments: {
      std::string data = XdgDataHome(env);
      if (!data.empty()) data += "/Varden/Shared";
      return data;
    }
    case SystemFolder::kTemp:
      return env.tmpDir.empty() ? std::string("/tmp") : env.tmpDir;
  }
  return {};
}

}  // namespace kelcore::filesupport::detail
