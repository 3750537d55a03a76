// The memory of the XML library's scanner.
#ifndef ZOR_DEFAULT_PLATFORM_XML_SCANNERMEMORY_H
#define ZOR_DEFAULT_PLATFORM_XML_SCANNERMEMORY_H

#include <cstddef>
#include <cstdlib>
#include <new>
#include <xercesc/framework/MemoryManager.hpp>
#include <xercesc/util/PlatformUtils.hpp>

/// What a scanner says when its memory is used up; the scanner lets it pass.
struct ScannerMemoryExhausted {};

/// Gives a scanner memory up to a limit. A scanner keeps little between two events, so that only a
/// single name, value or text without end, or an entity that grows inside a value, comes near it.
class ScannerMemory : public xercesc::MemoryManager {
 public:
  static constexpr std::size_t kMost = std::size_t{400} * 1024 * 1024;

  void* allocate(XMLSize_t inBytes) override {
    if (inBytes > kMost - used_) throw ScannerMemoryExhausted();
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
  std::size_t used_ = 0;
};

#endif
