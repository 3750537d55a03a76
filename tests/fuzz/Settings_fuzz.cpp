// Files in TOML: settings, message catalogues, logical locations, rules and policies.
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "fuzz/Fuzz.h"
#include "platform/system/ZORDocumentLocation.h"
#include "platform/system/ZORMsgCatalog.h"
#include "platform/system/ZORSettingRepository.h"
#include "toolkit/Error.h"
#include "toolkit/review/Gate.h"
#include "toolkit/review/Rules.h"

namespace fs = std::filesystem;

namespace {

/// Where the platform looks for all of these.
class Folder {
 public:
  Folder() : path_(Memory() / ("zor-fuzz-" + std::to_string(getpid()))) {
    fs::create_directories(path_ / "en");
    setenv("ZOR_SETTINGS_PATH", path_.c_str(), 1);
    setenv("ZOR_CATALOGUE_PATH", path_.c_str(), 1);
    setenv("ZOR_LANG", "en", 1);
  }
  ~Folder() {
    std::error_code ignored;
    fs::remove_all(path_, ignored);
  }
  Folder(const Folder&) = delete;
  Folder& operator=(const Folder&) = delete;

  /// Files on a disk would wait for it.
  static fs::path Memory() {
    return fs::is_directory("/dev/shm") ? fs::path("/dev/shm") : fs::temp_directory_path();
  }

  void Write(const char* inName, const std::string& inText) const {
    std::ofstream(path_ / inName, std::ios::binary) << inText;
  }

 private:
  fs::path path_;
};

void ReadSettings() {
  ZORSettingRepository* const settings = ZORSettingRepository::GetRepository("Fuzz");
  if (settings == nullptr) return;
  ZORUnicodeString text;
  int integer = 0, integers[3] = {};
  double number = 0;
  for (const char* const key : {"a", "k", "PictureZoom"}) {
    settings->ReadSetting(key, &text);
    settings->ReadSetting(key, &integer);
    settings->ReadSetting(key, &number);
    settings->ReadSetting(key, integers, 3);
  }
}

void ReadMessages() {
  const ZORUnicodeString parameters[] = {"one", "two"};
  for (const char* const key : {"a", "k", "PictureZoom"})
    ZORMsgCatalog::BuildMessage("Fuzz", key, parameters, 2, "default");
}

template <class Read>
void TryReading(const Read& inRead, const std::string& inText) {
  try {
    inRead("text", inText);
  } catch (const ZORToolkit::Error&) {
    return;  // refused
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* inBytes, std::size_t inSize) {
  static const Folder folder;
  const std::string text = fuzz::Text(inBytes, inSize);
  for (const char* const name : {"Fuzz.toml", "en/Fuzz.toml"}) folder.Write(name, text);
  ReadSettings();
  ReadMessages();
  TryReading([](const char* name, const std::string& from) { ZORToolkit::ReadRules(name, from); },
             text);
  TryReading([](const char* name, const std::string& from) { ZORToolkit::ReadPolicy(name, from); },
             text);
  return 0;
}
