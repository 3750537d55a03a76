#include "platform/system/ZORMsgCatalog.h"

#ifdef __unix__
#include <unistd.h>
#endif

#include <array>
#include <cstring>
#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "default_platform/system/TomlFiles.h"
#include "platform/system/ZORGetEnv.h"
#include "platform/system/ZORMsg.h"

struct ZORMsgCatalog::Messages {
  // Looked up by views.
  struct Hash {
    using is_transparent = void;
    std::size_t operator()(std::string_view inKey) const {
      return std::hash<std::string_view>()(inKey);
    }
  };
  std::unordered_map<std::string, ZORMsg, Hash, std::equal_to<>> byKey;
};

namespace {

bool HasSlash(const ZORUnicodeString& inText) {
  const ZORUC2Bytes* const units = inText.ConvertToUCChar();
  for (int i = 0; i < inText.GetLengthInChar(); ++i)
    if (units[i] == u'/') return true;
  return false;
}

using ZORDefault::FileCache;
using Messages = ZORMsgCatalog::Messages;
using MessagesPointer = std::shared_ptr<const Messages>;

MessagesPointer ReadMessages(std::string_view inText) {
  const auto table = ZORDefault::ParseToml(inText);
  if (!table) return nullptr;
  auto messages = std::make_shared<Messages>();
  for (const auto& [key, value] : *table)
    if (const std::string* const text = std::get_if<std::string>(&value))
      messages->byKey.emplace(key, ZORMsg(ZORUnicodeString(text->c_str())));
  return messages;
}

FileCache<Messages>& CatalogueFiles() {
  static auto* const files = new FileCache<Messages>(&ReadMessages);
  return *files;
}

// The language of a locale's name: "fr_FR.UTF-8" is "fr", "C" and its like are English.
std::string LanguageOf(std::string_view inLocale) {
  std::string language(inLocale.substr(0, inLocale.find_first_of("_-.@")));
  for (char& letter : language)
    if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
  const bool isWord = language.find_first_not_of("abcdefghijklmnopqrstuvwxyz") == language.npos;
  return language.size() < 2 || language == "posix" || !isWord ? "en" : language;
}

// The variables that say where a catalogue is, as they are now; null for one that is not set.
struct SearchVariables {
  std::array<const char*, 4> languages{};
  const char* path = nullptr;

  // The first language that is not empty counts.
  std::string_view Locale() const {
    for (const char* const value : languages)
      if (value && *value) return value;
    return "en";
  }
};
constexpr std::array<std::string_view, 4> kLanguageVariables = {"ZOR_LANG", "LC_ALL", "LC_MESSAGES",
                                                                "LANG"};
constexpr std::string_view kPathVariable = "ZOR_CATALOGUE_PATH";

#ifdef __unix__

// Whether an entry begins as one of the variables does, which few others do.
bool MayBeVariable(const char* inEntry) {
  return (inEntry[0] == 'Z' && inEntry[1] == 'O') ||
         (inEntry[0] == 'L' && (inEntry[1] == 'A' || inEntry[1] == 'C'));
}

// One pass over the environment in place of one for each variable: each call of a host asks.
SearchVariables ReadSearchVariables() {
  SearchVariables found;
  const auto keep = [](const char* inEntry, std::string_view inName, const char*& ioValue) {
    if (ioValue == nullptr && std::strncmp(inEntry, inName.data(), inName.size()) == 0 &&
        inEntry[inName.size()] == '=')
      ioValue = inEntry + inName.size() + 1;
  };
  for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
    if (!MayBeVariable(*entry)) continue;
    for (std::size_t i = 0; i < found.languages.size(); ++i)
      keep(*entry, kLanguageVariables[i], found.languages[i]);
    keep(*entry, kPathVariable, found.path);
  }
  return found;
}

#else

SearchVariables ReadSearchVariables() {
  SearchVariables found;
  for (std::size_t i = 0; i < found.languages.size(); ++i)
    found.languages[i] = ZORGetEnv(kLanguageVariables[i].data());
  found.path = ZORGetEnv(kPathVariable.data());
  return found;
}

#endif

// The files that a catalogue may be, the first to be looked for first. Hosts ask for the same one a
// hundred thousand times: the last answer holds as long as the environment does.
std::shared_ptr<const std::vector<std::string>> CandidatesOf(const char* inName) {
  struct Search {
    std::string name, locale, path;
    std::shared_ptr<const std::vector<std::string>> files;
  };
  static std::mutex mutex;
  static auto* const lastOfAll = new Search;
  const std::lock_guard lock(mutex);
  Search& last = *lastOfAll;
  const SearchVariables variables = ReadSearchVariables();
  const std::string_view locale = variables.Locale();
  const std::string_view pathNow = variables.path == nullptr ? "" : variables.path;
  if (last.files != nullptr && last.name == inName && last.locale == locale && last.path == pathNow)
    return last.files;
  const std::string language = LanguageOf(locale);
  const std::vector<std::string> directories = ZORDefault::CatalogueDirectories();
  auto files = std::make_shared<std::vector<std::string>>(
      ZORDefault::TomlCandidates(directories, language + "/", inName));
  for (std::string& file : ZORDefault::TomlCandidates(directories, "en/", inName))
    files->push_back(std::move(file));
  last = Search{inName, std::string(locale), std::string(pathNow), std::move(files)};
  return last.files;
}

MessagesPointer FindMessages(const char* inName) {
  if (!inName) return nullptr;
  return CatalogueFiles().GetFirst(*CandidatesOf(inName));
}

}  // namespace

ZORMsg::ZORMsg() = default;

ZORMsg::ZORMsg(const ZORUnicodeString& inText) : text_(inText), isPlain_(!HasSlash(inText)) {}

ZORUnicodeString ZORMsg::BuildMessage(const ZORUnicodeString* inParameters, int inCount) const {
  if (isPlain_) return text_;
  const ZORUC2Bytes* const units = text_.ConvertToUCChar();
  const int length = text_.GetLengthInChar();
  const auto unitAt = [&](int inPosition) {
    return inPosition < length ? units[inPosition] : u'\0';
  };
  ZORUnicodeString message;
  for (int i = 0; i < length; ++i) {
    const ZORUC2Bytes place = unitAt(i + 2);
    if (units[i] == u'/' && unitAt(i + 1) == u'/') {
      message.AppendUTF16(u"/", 1);
      i += 1;
    } else if (units[i] == u'/' && unitAt(i + 1) == u'p' && place >= u'1' && place <= u'9') {
      if (inParameters && place - u'1' < inCount) message += inParameters[place - u'1'];
      i += 2;
    } else {
      message.AppendUTF16(units + i, 1);
    }
  }
  return message;
}

ZORMsgCatalog::ZORMsgCatalog() = default;
ZORMsgCatalog::~ZORMsgCatalog() = default;

int ZORMsgCatalog::LoadMsgCatalog(const char* inName) {
  messages_ = FindMessages(inName);
  return messages_ ? 1 : 0;
}

ZORMsg ZORMsgCatalog::GetCatalogMsg(const char* inKey) const {
  if (!messages_ || !inKey) return ZORMsg();
  const auto found = messages_->byKey.find(std::string_view(inKey));
  return found == messages_->byKey.end() ? ZORMsg() : found->second;
}

ZORUnicodeString ZORMsgCatalog::BuildMessage(const char* inCatalogue, const char* inKey,
                                             const ZORUnicodeString* inParameters, int inCount,
                                             const ZORUnicodeString& inDefault) {
  const MessagesPointer messages = FindMessages(inCatalogue);
  if (!messages || !inKey) return inDefault;
  const auto found = messages->byKey.find(std::string_view(inKey));
  if (found == messages->byKey.end()) return inDefault;
  return found->second.BuildMessage(inParameters, inCount);
}
