// Reading and writing zip archives by libzip.
#include <zip.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <exception>
#include <memory>

#include "foundation/PluginFunction.h"
#include "toolkit/exchange/ExchangeLibrary.h"

namespace ZORToolkit {
namespace {

constexpr std::uint64_t kMiB = std::uint64_t{1} << 20;
constexpr std::uint64_t kMaxUnpacked = 4096 * kMiB, kMaxKept = 512 * kMiB;
/// Texts of XML shrink to a thirtieth at most; what shrinks more than this is made to fill memory.
constexpr std::uint64_t kMaxRatio = 200, kHarmless = 16 * kMiB;

struct Refused {
  std::string reason;
};

struct ArchiveCloser {
  void operator()(zip_t* inArchive) const { zip_discard(inArchive); }
};
using Archive = std::unique_ptr<zip_t, ArchiveCloser>;

struct FileCloser {
  void operator()(zip_file_t* inFile) const { zip_fclose(inFile); }
};
using OpenEntry = std::unique_ptr<zip_file_t, FileCloser>;

std::string TextOf(int inCode) {
  zip_error_t error;
  zip_error_init_with_code(&error, inCode);
  std::string text = zip_error_strerror(&error);
  zip_error_fini(&error);
  return text;
}

/// @return the name with slashes. Refuses one that leads out of the folder that it is unpacked
/// into.
std::string CheckedName(const char* inName) {
  std::string name = inName == nullptr ? "" : inName;
  std::ranges::replace(name, '\\', '/');
  const bool hasDrive = name.size() > 1 && name[1] == ':';
  if (name.empty() || name.front() == '/' || hasDrive ||
      ("/" + name + "/").find("/../") != std::string::npos)
    throw Refused{"an entry's name leads out of the archive: \"" + name.substr(0, 100) + "\""};
  return name;
}

class ArchiveReader {
 public:
  explicit ArchiveReader(const std::string& inPath) {
    int code = 0;
    archive_.reset(zip_open(inPath.c_str(), ZIP_RDONLY, &code));
    if (archive_ == nullptr)
      throw Refused{code == ZIP_ER_NOZIP ? "is no zip archive, or a damaged one" : TextOf(code)};
    const zip_int64_t count = zip_get_num_entries(archive_.get(), 0);
    if (count > static_cast<zip_int64_t>(kMaxArchiveEntries))
      throw Refused{"has " + std::to_string(count) + " entries, more than " +
                    std::to_string(kMaxArchiveEntries)};
    CheckSizes(static_cast<zip_uint64_t>(count));
  }

  void Read(const std::function<bool(std::string_view)>& inWants,
            const std::function<void(ArchiveEntry&&)>& inVisit) {
    std::uint64_t kept = 0;
    for (std::size_t i = 0; i < names_.size(); ++i) {
      if (names_[i].back() == '/') continue;
      const bool isWanted = inWants(names_[i]);
      kept += isWanted ? sizes_[i] : 0;
      if (kept > kMaxKept) throw Refused{"holds more than 512 MB of XML"};
      inVisit({names_[i], ReadEntry(i, isWanted)});
    }
  }

 private:
  void CheckSizes(zip_uint64_t inCount) {
    std::uint64_t unpacked = 0, packed = 0;
    for (zip_uint64_t i = 0; i < inCount; ++i) {
      zip_stat_t about;
      if (zip_stat_index(archive_.get(), i, ZIP_FL_ENC_RAW, &about) != 0)
        throw Refused{zip_strerror(archive_.get())};
      names_.push_back(CheckedName(about.name));
      if (about.encryption_method != ZIP_EM_NONE)
        throw Refused{"is encrypted: \"" + names_.back() + "\""};
      sizes_.push_back(about.size);
      packed += about.comp_size;
      unpacked += std::min(about.size, kMaxUnpacked);
      if (unpacked > kHarmless && unpacked / kMaxRatio > packed)
        throw Refused{"unpacks to " + std::to_string(kMaxRatio) + " times its size or more: \"" +
                      names_.back() + "\""};
      if (unpacked >= kMaxUnpacked) throw Refused{"unpacks to more than 4 GB"};
    }
  }

  std::string ReadEntry(std::size_t inIndex, bool inIsKept) {
    const auto fail = [&](const std::string& inReason) {
      throw Refused{"the entry \"" + names_[inIndex] + "\" cannot be read: " + inReason};
    };
    const OpenEntry entry(zip_fopen_index(archive_.get(), inIndex, 0));
    if (entry == nullptr) fail(zip_strerror(archive_.get()));
    std::string bytes;
    std::uint64_t size = 0;
    for (;;) {
      const zip_int64_t count = zip_fread(entry.get(), buffer_.data(), buffer_.size());
      if (count < 0) fail(zip_file_strerror(entry.get()));
      if (count == 0) break;
      size += static_cast<std::uint64_t>(count);
      if (size > sizes_[inIndex]) fail("it is larger than it says");
      if (inIsKept) bytes.append(buffer_.data(), static_cast<std::size_t>(count));
    }
    if (size != sizes_[inIndex]) fail("it is cut off");
    return bytes;
  }

  Archive archive_;
  std::vector<std::string> names_;
  std::vector<std::uint64_t> sizes_;
  std::string buffer_ = std::string(std::size_t{1} << 16, '\0');
};

/// The bytes of a new entry, made when libzip asks for them and freed when it has them.
class EntrySource {
 public:
  /// What a function of an entry raised is kept in ioError, since it cannot pass through libzip.
  EntrySource(const std::function<std::string()>& inMake, std::exception_ptr& ioError)
      : make_(inMake), error_(ioError) {}

  static zip_int64_t Serve(void* inSelf, void* ioData, zip_uint64_t inLength,
                           zip_source_cmd_t inCommand) {
    auto* const self = static_cast<EntrySource*>(inSelf);
    switch (inCommand) {
      case ZIP_SOURCE_OPEN:
        return self->Open();
      case ZIP_SOURCE_READ:
        return self->Read(static_cast<char*>(ioData), inLength);
      case ZIP_SOURCE_CLOSE:
        std::string().swap(self->bytes_);  // an assignment would keep the memory
        return 0;
      case ZIP_SOURCE_STAT:
        zip_stat_init(static_cast<zip_stat_t*>(ioData));
        return sizeof(zip_stat_t);
      case ZIP_SOURCE_ERROR:
        return zip_error_to_data(&self->report_, ioData, inLength);
      case ZIP_SOURCE_FREE:
        delete self;
        return 0;
      case ZIP_SOURCE_SUPPORTS:
        return ZIP_SOURCE_SUPPORTS_READABLE;
      default:
        zip_error_set(&self->report_, ZIP_ER_OPNOTSUPP, 0);
        return -1;
    }
  }

 private:
  zip_int64_t Open() {
    at_ = 0;
    try {
      bytes_ = make_();
      return 0;
    } catch (...) {
      error_ = std::current_exception();
      zip_error_set(&report_, ZIP_ER_READ, 0);
      return -1;
    }
  }

  zip_int64_t Read(char* outBytes, zip_uint64_t inLength) {
    const std::size_t count = std::min(static_cast<std::size_t>(inLength), bytes_.size() - at_);
    std::memcpy(outBytes, bytes_.data() + at_, count);
    at_ += count;
    return static_cast<zip_int64_t>(count);
  }

  const std::function<std::string()>& make_;
  std::exception_ptr& error_;
  std::string bytes_;
  std::size_t at_ = 0;
  zip_error_t report_{};
};

class ArchiveWriter {
 public:
  explicit ArchiveWriter(const std::string& inPath) {
    int code = 0;
    archive_.reset(zip_open(inPath.c_str(), ZIP_CREATE | ZIP_TRUNCATE, &code));
    if (archive_ == nullptr) throw Refused{TextOf(code)};
  }

  void Add(const NewArchiveEntry& inEntry) {
    constexpr zip_uint16_t kFirstDay = (1 << 5) + 1;  // 1 January 1980, the first that there is
    constexpr zip_uint32_t kDefaultLevel = 6;
    zip_source_t* const source = zip_source_function(archive_.get(), &EntrySource::Serve,
                                                     new EntrySource(inEntry.make, error_));
    if (source == nullptr) throw Refused{zip_strerror(archive_.get())};
    const zip_int64_t index =
        zip_file_add(archive_.get(), inEntry.name.c_str(), source, ZIP_FL_ENC_UTF_8);
    if (index < 0) {
      zip_source_free(source);
      throw Refused{zip_strerror(archive_.get())};
    }
    const auto place = static_cast<zip_uint64_t>(index);
    const zip_int32_t method = inEntry.isCompressed ? ZIP_CM_DEFLATE : ZIP_CM_STORE;
    if (zip_set_file_compression(archive_.get(), place, method,
                                 inEntry.isCompressed ? kDefaultLevel : 0) != 0 ||
        zip_file_set_dostime(archive_.get(), place, 0, kFirstDay, 0) != 0)
      throw Refused{zip_strerror(archive_.get())};
  }

  void Finish() {
    if (zip_close(archive_.get()) != 0) {
      if (error_) std::rethrow_exception(error_);
      throw Refused{zip_strerror(archive_.get())};
    }
    static_cast<void>(archive_.release());
  }

 private:
  std::exception_ptr error_;
  Archive archive_;
};

}  // namespace
}  // namespace ZORToolkit

ZOR_PLUGIN_FUNCTION bool ZORReadArchive(
    const std::string& inPath, const std::function<bool(std::string_view)>& inWants,
    const std::function<void(ZORToolkit::ArchiveEntry&&)>& inVisit, std::string& outReason) {
  try {
    ZORToolkit::ArchiveReader(inPath).Read(inWants, inVisit);
    return true;
  } catch (const ZORToolkit::Refused& refused) {
    outReason = refused.reason;
    return false;
  }
}

ZOR_PLUGIN_FUNCTION bool ZORWriteArchive(const std::string& inPath,
                                         std::span<const ZORToolkit::NewArchiveEntry> inEntries,
                                         std::string& outReason) {
  try {
    if (inEntries.size() > ZORToolkit::kMaxArchiveEntries)
      throw ZORToolkit::Refused{"would have " + std::to_string(inEntries.size()) +
                                " entries, more than " +
                                std::to_string(ZORToolkit::kMaxArchiveEntries)};
    ZORToolkit::ArchiveWriter writer(inPath);
    for (const ZORToolkit::NewArchiveEntry& entry : inEntries) writer.Add(entry);
    writer.Finish();
    return true;
  } catch (const ZORToolkit::Refused& refused) {
    outReason = refused.reason;
    return false;
  }
}
