#include "default_platform/product_structure/model_reader/FileSandbox.h"

#include <cerrno>
#include <filesystem>
#include <map>
#include <optional>
#include <vector>

#include "default_platform/product_structure/model_reader/SandboxedCalls.h"
#include "foundation/Hash.h"
#include "foundation/ReadWholeFile.h"
#include "foundation/TemporaryFile.h"

namespace ZORDefault {
namespace {

namespace fs = std::filesystem;
using ZORFoundation::Descriptor;

class FileSandbox {
 public:
  FileSandbox(const std::string& inModelPath, int inModelBytes)
      : modelPath_(fs::path(inModelPath).lexically_normal()),
        folder_(fs::canonical(modelPath_.parent_path())),
        modelBytes_(inModelBytes) {}

  int Open(const char* inPath) {
    const fs::path path = fs::absolute(inPath).lexically_normal();
    if (path == modelPath_) return Reopen(modelBytes_);
    const auto known = files_.find(path);
    const File& file = known != files_.end() ? known->second : (files_[path] = Read(path));
    if (file.bytes.IsOpen()) return Reopen(file.bytes.Get());
    errno = file.error;
    return -1;
  }

  ReferencedFile At(const std::string& inName) const {
    const fs::path path = (modelPath_.parent_path() / inName).lexically_normal();
    ReferencedFile result;
    result.name = inName;
    if (const auto known = files_.find(path); known != files_.end()) {
      result.state = known->second.state;
      result.hash = known->second.hash;
    } else {
      std::error_code error;
      result.state = fs::exists(path, error) ? ReferencedFile::State::kUnread
                                             : ReferencedFile::State::kMissing;
    }
    return result;
  }

  std::string FirstNonRegular() const {
    for (const auto& [path, file] : files_)
      if (file.isNonRegular) return NameOf(path);
    return "";
  }

  std::vector<std::string> Refused() const {
    std::vector<std::string> names;
    for (const auto& [path, file] : files_)
      if (file.state == ReferencedFile::State::kRefused) names.push_back(NameOf(path));
    return names;
  }

  bool HasChanged() const { return hasChanged_; }
  bool IsReading() const { return isReading_; }

 private:
  struct File {
    ReferencedFile::State state = ReferencedFile::State::kMissing;
    int error = ENOENT;
    bool isNonRegular = false;
    std::uint64_t hash = 0;
    Descriptor bytes;
  };

  std::string NameOf(const fs::path& inPath) const {
    return inPath.lexically_relative(modelPath_.parent_path()).string();
  }

  bool IsInFolder(const fs::path& inPath) const {
    const fs::path relative = inPath.lexically_relative(folder_);
    return !relative.empty() && *relative.begin() != "..";
  }

  static File Refusal(int inError, bool inIsNonRegular) {
    File file;
    file.state = ReferencedFile::State::kRefused;
    file.error = inError;
    file.isNonRegular = inIsNonRegular;
    return file;
  }

  File Read(const fs::path& inPath) {
    std::error_code error;
    const fs::path target = fs::canonical(inPath, error);
    if (error) return File();
    const fs::file_status status = fs::status(target, error);
    const bool isNonRegular = !fs::is_regular_file(status) && !fs::is_directory(status);
    // What is no file may also lie elsewhere, behind a link.
    if (isNonRegular) return Refusal(EACCES, IsInFolder(inPath) || IsInFolder(target));
    if (!IsInFolder(target)) return Refusal(EACCES, false);
    try {
      isReading_ = true;
      const ZORFoundation::WholeFile whole = ZORFoundation::ReadWholeFile(target.string());
      isReading_ = false;
      hasChanged_ = hasChanged_ || !whole.IsConsistent();
      File file;
      file.state = ReferencedFile::State::kRead;
      file.hash = ZORFoundation::Hash64Of(whole.bytes);
      file.bytes = ZORFoundation::NewMemoryFile(whole.bytes);
      return file;
    } catch (const ZORFoundation::FileError& failure) {
      isReading_ = false;
      return Refusal(failure.Code(), failure.Code() == ESPIPE);
    }
  }

  fs::path modelPath_;
  fs::path folder_;  // without links
  int modelBytes_;
  std::map<fs::path, File> files_;
  bool hasChanged_ = false;
  bool isReading_ = false;  // this opens a file itself
};

std::optional<FileSandbox>& Sandbox() {
  static std::optional<FileSandbox> sandbox;
  return sandbox;
}

}  // namespace

void EnterFileSandbox(const std::string& inModelPath, int inModelBytes) {
  Sandbox().emplace(inModelPath, inModelBytes);
}

ReferencedFile ReferencedFileAt(const std::string& inName) { return Sandbox()->At(inName); }
std::string FirstNonRegularFile() { return Sandbox()->FirstNonRegular(); }
std::vector<std::string> RefusedFiles() { return Sandbox()->Refused(); }
bool HasChangedFile() { return Sandbox()->HasChanged(); }

std::optional<int> OpenInSandbox(const char* inPath, bool inWrites) {
  if (!Sandbox() || Sandbox()->IsReading()) return std::nullopt;
  if (!inWrites && inPath != nullptr) return Sandbox()->Open(inPath);
  errno = EACCES;
  return -1;
}

}  // namespace ZORDefault
