// The memory of the XML library's scanner.
#ifndef ZOR_DEFAULT_PLATFORM_XML_SCANNERMEMORY_H
#define ZOR_DEFAULT_PLATFORM_XML_SCANNERMEMORY_H

#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <new>
#include <xercesc/framework/MemoryManager.hpp>
#include <xercesc/sax/Locator.hpp>
#include <xercesc/util/PlatformUtils.hpp>

/// Raised where a scanner's memory is used up; the scanner lets it pass.
struct ScannerMemoryExhausted {
  std::uint64_t line;
  std::uint64_t column;
};

/// Gives a scanner memory up to a limit. A scanner keeps little between two events, so that only a
/// single name, value or text without end, or an entity that grows inside a value, comes near it, and documents with a million different names.
class ScannerMemory : public xercesc::MemoryManager {
 public:
  static constexpr std::size_t kMost = std::size_t{400} * 1024 * 1024;

  /// @param inPlace where the scanner is, for errors; null for nowhere. Lives as long as the scanner.
  void SetPlace(const xercesc::Locator* inPlace) { place_ = inPlace; }

  void* allocate(XMLSize_t inBytes) override {
    if (inBytes > kMost - used_) Fail();
    void* const block = std::malloc(sizeof(Head) + inBytes);
    if (block == nullptr) throw std::bad_alloc();
    used_ += inBytes;
    return new (block) Head{inBytes} + 1;
  }
  void deallocate(void* inPlace) override {
    if (inPlace == nullptr) return;
    Head* const head = static_cast<Head*>(inPlace) - 1;
    used_ -= head->bytes;
    std::free(head);
  }
  xercesc::MemoryManager* getExceptionMemoryManager() override {
    return xercesc::XMLPlatformUtils::fgMemoryManager;
  }

 private:
  struct alignas(std::max_align_t) Head {
    std::size_t bytes;
  };
  [[noreturn]] void Fail() const {
    if (place_ == nullptr) throw ScannerMemoryExhausted{0, 0};
    throw ScannerMemoryExhausted{place_->getLineNumber(), place_->getColumnNumber()};
  }

  std::size_t used_ = 0;
  const xercesc::Locator* place_ = nullptr;
};

#endif
