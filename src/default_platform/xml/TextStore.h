// The texts and names of one document.
#ifndef ZOR_DEFAULT_PLATFORM_XML_TEXTSTORE_H
#define ZOR_DEFAULT_PLATFORM_XML_TEXTSTORE_H

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "default_platform/xml/Latin1.h"
#include "foundation/Bytes.h"

/// As ==, which the standard library does unit by unit.
inline bool IsSameText(std::u16string_view inA, std::u16string_view inB) {
  return inA.size() == inB.size() &&
         (inA.empty() || std::memcmp(inA.data(), inB.data(), inA.size() * sizeof(char16_t)) == 0);
}

/// Characters as they are stored: Latin-1 or UTF-16.
class TextView {
 public:
  TextView(std::string_view inLatin1)
      : units_(inLatin1.data()), length_(inLatin1.size()), isWide_(false) {}
  TextView(std::u16string_view inUnits)
      : units_(inUnits.data()), length_(inUnits.size()), isWide_(true) {}

  std::size_t Length() const { return length_; }
  bool IsWide() const { return isWide_; }
  std::string_view Latin1() const { return {static_cast<const char*>(units_), length_}; }
  std::u16string_view Units() const { return {static_cast<const char16_t*>(units_), length_}; }
  const void* Data() const { return units_; }
  std::size_t Bytes() const { return length_ * (isWide_ ? sizeof(char16_t) : 1); }

  /// @param outUnits room for Length() units.
  void CopyTo(char16_t* outUnits) const;
  std::u16string ToUtf16() const;

 private:
  const void* units_;
  std::size_t length_;
  bool isWide_;
};

bool IsSameText(TextView inA, TextView inB);

/// An immutable text: this head, then its characters. The texts of a tree are Latin-1 where every
/// character fits a byte, else UTF-16; equal ones are therefore equal bytes. Of those that strings
/// own (see DOMString.cpp) all 32 bits count the units.
struct DOM_Text {
  static constexpr std::uint32_t kWide = std::uint32_t{1} << 31;
  static constexpr std::uint32_t kMaxLength = kWide - 1;  // of a tree's text

  std::uint32_t head;

  std::uint32_t Length() const { return head & kMaxLength; }
  bool IsWide() const { return (head & kWide) != 0; }
  const char* Latin1() const { return reinterpret_cast<const char*>(this + 1); }
  const char16_t* Units() const { return reinterpret_cast<const char16_t*>(this + 1); }
  char16_t* Units() { return reinterpret_cast<char16_t*>(this + 1); }
  TextView View() const {
    if (IsWide()) return std::u16string_view(Units(), Length());
    return std::string_view(Latin1(), Length());
  }
};

/// Where a text lies in its store, in steps of four bytes; 0 for none.
using TextRef = std::uint32_t;

/// The recent texts of one source, such as one attribute of one kind of element.
struct TextSeries {
  const DOM_Text* last = nullptr;
  TextRef lastRef = 0;
  std::uint32_t newInARow = 0;
};

/// An arena of texts. Short recent ones are stored once: documents repeat their indentation, "NO",
/// "0" and the like.
class TextStore {
 public:
  TextStore();
  const DOM_Text& operator[](TextRef inText) const {
    return *reinterpret_cast<const DOM_Text*>(pages_[inText >> kPageBits] +
                                              (inText & (kPageSteps - 1)) * kStep);
  }
  TextRef Add(TextView inText);
  /// As Add, of a text that a store keeps already.
  TextRef AddStored(TextView inText);
  /// As Add. After a long run of different texts, as of numbers, only the last one is compared.
  TextRef Add(std::string_view inLatin1, TextSeries& ioSeries) {
    if (ioSeries.last == nullptr || ioSeries.last->head != inLatin1.size() ||
        !ZORFoundation::AreSameBytes(ioSeries.last->Latin1(), inLatin1.data(), inLatin1.size()))
      return AddOther(inLatin1, ioSeries);
    ioSeries.newInARow = 0;
    return ioSeries.lastRef;
  }
  /// As Add, as UTF-16 and without looking for an equal text.
  const DOM_Text* AddWide(std::u16string_view inUnits);
  /// The units of a text as UTF-16, kept as long as the store.
  const char16_t* Widen(const DOM_Text& inText);

 private:
  /// A recent text with its hash, so that most others need not be compared.
  struct Shared {
    std::uint64_t hash;
    TextRef text;
  };
  struct Widened {
    const DOM_Text* narrow = nullptr;
    const DOM_Text* wide = nullptr;
  };
  Widened& SlotOf(const DOM_Text* inNarrow);
  void GrowWidened();
  TextRef AddOther(std::string_view inLatin1, TextSeries& ioSeries);
  TextRef AddShared(TextView inText);
  TextRef AddUnshared(TextView inText);
  TextRef Allocate(std::size_t inBytes);
  char* PlaceOf(TextRef inText) {
    return pages_[inText >> kPageBits] + (inText & (kPageSteps - 1)) * kStep;
  }
  void AddPages(std::size_t inBytes);

  static constexpr std::size_t kStep = 4;
  static constexpr std::uint32_t kPageBits = 14;
  static constexpr std::uint32_t kPageSteps = 1u << kPageBits;
  static constexpr std::size_t kPageBytes = kPageSteps * kStep;
  static constexpr std::size_t kSharedSlots = 4096;
  static constexpr std::size_t kMaxShared = 64;

  std::vector<std::unique_ptr<char[]>> blocks_;
  std::vector<char*> pages_;  // of kPageBytes each; a large text spans several
  TextRef free_ = 0;
  TextRef end_ = 0;
  std::unique_ptr<Shared[]> shared_;
  std::string narrowed_;
  std::vector<Widened> widened_;  // open addressing; a power of two
  std::size_t widenedCount_ = 0;
};

/// Numbers the names of a document: equal names have equal numbers, from 1.
class NameTable {
 public:
  static constexpr std::uint32_t kMaxNames = 1u << 24;

  explicit NameTable(TextStore& ioTexts);
  std::uint32_t Intern(std::u16string_view inName);
  /// @param inName zero-terminated.
  /// @return 0 for a name that the document does not have, and for all that is not ASCII.
  std::uint32_t FindAscii(const char* inName) const {
    const Found& found = found_[PlaceOf(inName)];
    return found.name != 0 && std::strcmp(found.text, inName) == 0 ? found.name
                                                                   : FindNewAscii(inName);
  }
  const DOM_Text* TextOf(std::uint32_t inName) const { return names_[inName]; }
  std::u16string_view UnitsOf(std::uint32_t inName) const {
    return {names_[inName]->Units(), names_[inName]->Length()};
  }
  /// One more than the largest number.
  std::uint32_t End() const { return static_cast<std::uint32_t>(names_.size()); }

 private:
  static constexpr std::size_t kFound = 256;
  struct Found {
    std::uint32_t name = 0;
    char text[28] = {};
  };
  static std::size_t PlaceOf(const char* inName) {
    const auto address = reinterpret_cast<std::uintptr_t>(inName);
    return (address ^ (address >> 8)) % kFound;
  }
  std::uint32_t FindNewAscii(std::string_view inName) const;
  std::size_t SlotOf(std::u16string_view inName) const;
  void Grow();

  TextStore& texts_;
  std::vector<const DOM_Text*> names_;
  std::vector<std::uint32_t> slots_;  // open addressing; a power of two
  // Readers ask for the same few names by the same literals: the last short one found by each
  // address, all ASCII.
  mutable std::array<Found, kFound> found_{};
};

#endif
