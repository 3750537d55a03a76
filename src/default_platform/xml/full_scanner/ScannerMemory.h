// The memory of the XML library's scanner.
#ifndef ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_SCANNERMEMORY_H
#define ZOR_DEFAULT_PLATFORM_XML_FULL_SCANNER_SCANNERMEMORY_H

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <new>
#include <xercesc/framework/MemoryManager.hpp>
#include <xercesc/internal/XMLReader.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/util/PlatformUtils.hpp>

/// Raised when the limit is reached; the scanner lets it pass.
struct ScannerMemoryExhausted {
  std::uint64_t line;
  std::uint64_t column;
  const char* reason;
};

/// Gives a scanner memory up to a limit. A scanner keeps little between two events: only a huge
/// name, value or text, an entity that grows inside a value, or a million different names come near
/// it.
class ScannerMemory : public xercesc::MemoryManager {
 public:
  ScannerMemory() = default;
  /// Frees what the scanner leaks after some errors in a document type.
  ~ScannerMemory() override {
    while (blocks_.next != &blocks_) Free(blocks_.next);
  }
  ScannerMemory(const ScannerMemory&) = delete;
  ScannerMemory& operator=(const ScannerMemory&) = delete;

  static constexpr std::size_t kMaxBytes = std::size_t{400} * 1024 * 1024;
  /// Each entity that is expanded makes a reader, those of document types too, which the library's
  /// own limit does not count.
  static constexpr std::size_t kMaxReaders = 60'000;

  /// @param inPlace where the scanner is, for errors; null for nowhere. Lives as long as the
  /// scanner.
  void SetPlace(const xercesc::Locator* inPlace) { place_ = inPlace; }

  void* allocate(XMLSize_t inBytes) override {
    if (inBytes > kMaxBytes - used_)
      Fail("a name, value or text is too large, or there are too many names");
    if (IsReader(inBytes) && ++readers_ > kMaxReaders)
      Fail("entities are expanded more than 60,000 times");
    void* const block = std::malloc(sizeof(Head) + inBytes);
    if (block == nullptr) throw std::bad_alloc();
    used_ += inBytes;
    Head* const head = new (block) Head{inBytes, &blocks_, blocks_.next};
    head->next->previous = head;
    blocks_.next = head;
    return head + 1;
  }
  void deallocate(void* inPlace) override {
    if (inPlace != nullptr) Free(static_cast<Head*>(inPlace) - 1);
  }
  xercesc::MemoryManager* getExceptionMemoryManager() override {
    return xercesc::XMLPlatformUtils::fgMemoryManager;
  }

 private:
  struct alignas(std::max_align_t) Head {
    std::size_t bytes;
    Head* previous;
    Head* next;
  };
  void Free(Head* inHead) {
    used_ -= inHead->bytes;
    inHead->previous->next = inHead->next;
    inHead->next->previous = inHead->previous;
    std::free(inHead);
  }
  // The library puts a pointer before its objects.
  static bool IsReader(std::size_t inBytes) {
    return inBytes >= sizeof(xercesc::XMLReader) && inBytes <= sizeof(xercesc::XMLReader) + 64;
  }
  [[noreturn]] void Fail(const char* inReason) const {
    if (place_ == nullptr) throw ScannerMemoryExhausted{0, 0, inReason};
    throw ScannerMemoryExhausted{place_->getLineNumber(), place_->getColumnNumber(), inReason};
  }

  std::size_t used_ = 0;
  std::size_t readers_ = 0;
  Head blocks_{0, &blocks_, &blocks_};  // a ring
  const xercesc::Locator* place_ = nullptr;
};

#endif
