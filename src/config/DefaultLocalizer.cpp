#include <kelcore/config/DefaultLocalizer.h>
#include <kelcore/utility/UnicodeConversion.h>

#include <algorithm>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <mutex>
#include <string_view>
#include <vector>

namespace kelcore::config {
namespace {

using Translations = std::unordered_map<std::string, UTF16String>;  // one load, before merging

constexpr std::string_view kKeyPrefix = "$$$/";
constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

bool DecodeUTF8(std::string_view bytes, UTF16String& text) {
  utility::UnicodeErrorCode error = utility::kUnicodeNoError;
  text = utility::UTF8to16(UTF8String(bytes.begin(), bytes.end()), &error);
  return error == utility::kUnicodeNoError;
}

std::string Unescape(std::string_view text) {
  std::string result;
  result.reserve(text.size());
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] != '\\' || i + 1 == text.size()) {
      result.push_back(text[i]);
      continue;
    }
    switch (text[i + 1]) {
      case 'n':
        result.push_back('\n');
        ++i;
        break;
      case 't':
        result.push_back('\t');
        ++i;
        break;
      case '\\':
        result.push_back('\\');
        ++i;
        break;
      default:
        result.push_back('\\');
        break;
    }
  }
  return result;
}

void ParseDictionary(std::string_view content, Translations& into) {
  if (content.substr(0, kByteOrderMark.size()) == kByteOrderMark) {
    content.remove_prefix(kByteOrderMark.size());
  }
  while (!content.empty()) {
    const std::size_t end = content.find('\n');
    std::string_view line = content.substr(0, end);
    content.remove_prefix(end == std::string_view::npos ? content.size() : end + 1);
    if (!line.empty() && line.back() == '\r') line.remove_suffix(1);
    if (line.substr(0, kKeyPrefix.size()) != kKeyPrefix) continue;
    const std::size_t equals = line.find('=');
    if (equals == std::string_view::npos) continue;
    UTF16String translation;
    if (!DecodeUTF8(Unescape(line.substr(equals + 1)), translation)) continue;
    into[std::string(line.substr(0, equals))] = std::move(translation);
  }
}

std::filesystem::path ToPath(const UTF16String& folder) {
  const UTF8String utf8 = utility::UTF16to8(folder);
  return std::filesystem::path(std::u8string(utf8.begin(), utf8.end()));
}

std::vector<std::filesystem::path> ListDictionaryFiles(const std::filesystem::path& folder) {
  std::vector<std::filesystem::path> files;
  std::error_code error;
  for (std::filesystem::directory_iterator it(folder, error), end; !error && it != end;
       it.increment(error)) {
    if (it->is_regular_file(error) && it->path().extension() == ".txt") files.push_back(it->path());
  }
  std::sort(files.begin(), files.end(), [](const auto& a, const auto& b) {
    return a.filename().native() < b.filename().native();
  });
  return files;
}

}  // namespace

DefaultLocalizer::DefaultLocalizer() = default;

DefaultLocalizer::~DefaultLocalizer() = default;

UTF16String DefaultLocalizer::LocalizeString(const char* key) {
  if (key == nullptr) return UTF16String();
  const std::string_view whole(key);
  const std::size_t equals = whole.find('=');
  {
    const std::shared_lock<std::shared_mutex> lock(mutex_);
    const auto found = translations_.find(whole.substr(0, equals));
    if (found != translations_.end()) return found->second;
  }
  UTF16String text;
  DecodeUTF8(equals == std::string_view::npos ? whole : whole.substr(equals + 1), text);
  return text;
}

void DefaultLocalizer::LoadDictionary(const UTF16String& folder) {
  Translations loaded;
  for (const std::filesystem::path& file : ListDictionaryFiles(ToPath(folder))) {
    std::ifstream in(file, std::ios::binary | std::ios::ate);
    const std::streamoff size = in.tellg();
    if (!in || size < 0) continue;
    std::string content(static_cast<std::size_t>(size), '\0');
    if (!in.seekg(0) || !in.read(content.data(), size)) continue;
    ParseDictionary(content, loaded);
  }
  const std::unique_lock<std::shared_mutex> lock(mutex_);
  for (auto& [lookup, translation] : loaded) translations_[lookup] = std::move(translation);
}

std::size_t DefaultLocalizer::GetEntryCount() const {
  const std::shared_lock<std::shared_mutex> lock(mutex_);
  return translations_.size();
}

}  // namespace kelcore::config
