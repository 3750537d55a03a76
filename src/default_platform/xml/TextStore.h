// The texts and names of one document.
#ifndef ZOR_DEFAULT_PLATFORM_XML_TEXTSTORE_H
#define ZOR_DEFAULT_PLATFORM_XML_TEXTSTORE_H

#include <array>
#include <cstddef>
#include <memory>
#include <vector>

#include "default_platform/xml/DOM_Text.h"

/// What was met of the texts that come from one place, such as one attribute of one kind of element.
struct TextSeries {
  const DOM_Text* last = nullptr;
  std::uint32_t newInARow = 0;
};

/// Keeps texts in a few large blocks until it ends. Short texts that were met lately are kept once:
/// documents repeat their indentation, "NO", "0" and the like.
class TextStore {
 public:
  TextStore();
  const DOM_Text* Add(std::u16string_view inText);
  /// As Add. An equal text is no longer looked for, except the last one, where the texts of the
  /// series were all different for long: numbers mostly are.
  const DOM_Text* Add(std::u16string_view inText, TextSeries& ioSeries);
  /// As Add, without looking for an equal text.
  const DOM_Text* AddUnshared(std::u16string_view inText);

 private:
  /// A text met lately, with its hash, so that most others are told apart without being read.
  struct Shared {
    std::uint64_t hash;
    const DOM_Text* text;
  };
  char* Allocate(std::size_t inBytes);
  char* AllocateBlock(std::size_t inBytes);

  static constexpr std::size_t kSharedSlots = 4096;
  static constexpr std::size_t kLongestShared = 64;

  std::vector<std::unique_ptr<char[]>> blocks_;
  char* free_ = nullptr;
  char* end_ = nullptr;
  std::size_t nextBlock_;
  std::unique_ptr<Shared[]> shared_;
};

/// Numbers the names of a document: equal names have equal numbers, from 1.
class NameTable {
 public:
  explicit NameTable(TextStore& ioTexts);
  std::uint32_t Intern(std::u16string_view inName);
  /// @return 0 for a name that the document does not have.
  std::uint32_t Find(std::u16string_view inName) const;
  const DOM_Text* TextOf(std::uint32_t inName) const { return names_[inName]; }
  /// One more than the largest number.
  std::uint32_t End() const { return static_cast<std::uint32_t>(names_.size()); }

 private:
  std::size_t SlotOf(std::u16string_view inName) const;
  void Grow();

  TextStore& texts_;
  std::vector<const DOM_Text*> names_;
  std::vector<std::uint32_t> slots_;  // open addressing; a power of two
};

#endif
