#include "default_platform/xml/Utf8FastPath.h"

#include <algorithm>
#include <cstring>
#include <utility>

#include "default_platform/xml/XMLChars.h"

namespace {

constexpr std::size_t kFirstWindow = std::size_t{16} * 1024;
constexpr std::size_t kUsualWindow = std::size_t{256} * 1024;
// Larger constructs are for the full scanner, which limits them.
constexpr std::size_t kMaxWindow = std::size_t{64} * 1024 * 1024;
constexpr std::size_t kMaxDepth = 1'000'000;
// What is wrong so near the end of the window may only be cut off; longest is "<![CDATA[".
constexpr std::ptrdiff_t kMaxLookahead = 16;
constexpr std::size_t kFirstTexts = 256;
constexpr std::string_view kByteOrderMark = "\xEF\xBB\xBF";

bool IsTextAt(const char* inPlace, std::string_view inText) {
  return std::memcmp(inPlace, inText.data(), inText.size()) == 0;
}

}  // namespace

Utf8FastPath::Utf8FastPath(ByteReader& ioReader, DOM_Tree& ioTree)
    : reader_(ioReader),
      tree_(ioTree),
      window_(new char[kFirstWindow + ByteSearch::kPadding]),
      windowBytes_(kFirstWindow),
      slots_(kFirstTexts) {
  at_ = end_ = window_.get();
  open_.push_back({DOM_Tree::kDocument, 0, nullptr, nullptr});
}

void Utf8FastPath::Read() {
  ReadMore();
  if (end_ - at_ >= 3 && IsTextAt(at_, kByteOrderMark)) at_ += kByteOrderMark.size();
  ReadDeclaration();
  ReadContent();
  if (!hasRoot_ || open_.size() != 1) throw NeedsFullScanner();
  tree_.EndChildren(DOM_Tree::kDocument, open_.back().lastChild);
}

// ---- bytes

// Moves what is left to the front of the window, which grows when that is most of it.
void Utf8FastPath::ReadMore() {
  const auto kept = static_cast<std::size_t>(end_ - at_);
  std::size_t bytes = windowBytes_;
  if (kept * 2 > bytes) bytes *= 2;
  if (reader_.BytesRead() != 0) bytes = std::max(bytes, kUsualWindow);
  if (bytes > kMaxWindow) throw NeedsFullScanner();
  if (bytes != windowBytes_) {
    std::unique_ptr<char[]> larger(new char[bytes + ByteSearch::kPadding]);
    std::memcpy(larger.get(), at_, kept);
    window_ = std::move(larger);
    windowBytes_ = bytes;
  } else {
    std::memmove(window_.get(), at_, kept);
  }
  char* const begin = window_.get();
  std::size_t filled = kept;
  for (std::size_t count = 1; count != 0 && filled < windowBytes_; filled += count)
    count = reader_.Read(reinterpret_cast<unsigned char*>(begin) + filled, windowBytes_ - filled);
  isAllRead_ = filled < windowBytes_;
  at_ = begin;
  end_ = begin + filled;
  std::memset(begin + filled, 0, ByteSearch::kPadding);
}

void Utf8FastPath::Stop(const char* inPlace) const {
  if (!isAllRead_ && end_ - inPlace < kMaxLookahead) throw EndOfWindow();
  throw NeedsFullScanner();
}

// ---- the document

void Utf8FastPath::ReadDeclaration() {
  const char* const end = EndOfUtf8Declaration(at_);
  if (end == nullptr) throw NeedsFullScanner();
  at_ = end;
}

void Utf8FastPath::ReadContent() {
  while (true) {
    try {
      while (open_.size() > 1 || at_ != end_) ReadOne();
      if (isAllRead_) return;
    } catch (const EndOfWindow&) {
    }
    ReadMore();
  }
}

void Utf8FastPath::ReadOne() {
  if (*at_ == '<')
    ReadMarkup();
  else if (open_.size() > 1)
    ReadText();
  else
    SkipBlanks();
}

void Utf8FastPath::ReadMarkup() {
  switch (at_[1]) {
    case '/':
      return ReadEndTag();
    case '?':
      return ReadInstruction();
    case '!':
      return at_[2] == '-' ? ReadComment() : ReadSection();
    default:
      return ReadStartTag();
  }
}

// White space around the root is no part of the tree.
void Utf8FastPath::SkipBlanks() {
  const char* const at = AfterBlanks(at_);
  if (at != end_ && *at != '<') throw NeedsFullScanner();
  at_ = at;
}

// ---- elements

inline bool Utf8FastPath::IsNext(const char* inPlace, const Name& inName) const {
  const std::string& name = inName.utf8;
  if (end_ - inPlace <= static_cast<std::ptrdiff_t>(name.size())) return false;
  return inName.start.IsAt(inPlace) && (inName.start.IsWhole() || IsTextAt(inPlace, name));
}

void Utf8FastPath::ReadStartTag() {
  const char* at = at_ + 1;
  if (open_.size() == 1 && hasRoot_) throw NeedsFullScanner();
  Name& name = ReadElementName(at);
  at = ReadAttributes(at, name);
  const bool isEmpty = *at == '/';
  if (at[isEmpty ? 1 : 0] != '>') Stop(at);
  if (open_.size() > kMaxDepth) throw NeedsFullScanner();

  hasRoot_ = true;
  OpenElement& parent = open_.back();
  const DOM_Tree::Node element =
      tree_.AppendNew(parent.node, parent.lastChild, DOM_Node::ELEMENT_NODE, name.number, 0);
  parent.lastChild = element;
  parent.lastElement = &name;
  tree_.SetNewAttributes(element, attributes_);
  at_ = at + (isEmpty ? 2 : 1);
  if (!isEmpty) open_.push_back({element, 0, &name, nullptr});
}

Utf8FastPath::Name& Utf8FastPath::ReadElementName(const char*& ioPlace) {
  const auto find = [&]() -> Name& {
    const char* const begin = std::exchange(ioPlace, NameEnd(ioPlace));
    return FindName(begin, ioPlace);
  };
  if (open_.size() == 1) return find();
  Name*& expected = open_.back().NextElement();
  if (expected != nullptr && IsNext(ioPlace, *expected)) {
    const char* const end = ioPlace + expected->utf8.size();
    if (*end == '>' || *end == '/' || IsBlank(*end)) {
      ioPlace = end;
      return *expected;
    }
  }
  Name& name = find();
  expected = &name;
  return name;
}

inline TextRef Utf8FastPath::ReadValue(const char*& ioPlace, TextSeries& ioSeries) {
  const char quote = *ioPlace;
  if (quote != '"' && quote != '\'') Stop(ioPlace);
  const char* const value = ioPlace + 1;
  const char* const end = search_.EndOfValue(value, quote);
  if (*end != quote) return ReadSpecialValue(ioPlace, end);
  ioPlace = end + 1;
  return tree_.AddText({value, static_cast<std::size_t>(end - value)}, ioSeries);
}

// Reads up to the end of the tag; what ends it is left to the caller.
const char* Utf8FastPath::ReadAttributes(const char* inPlace, Name& ioElement) {
  attributes_.clear();
  const std::uint64_t element = ++elements_;
  const char* at = inPlace;
  for (std::size_t position = 0;; ++position) {
    const char* const before = at;
    at = AfterBlanks(at);
    if (*at == '>' || *at == '/') return at;
    if (at == before) Stop(at);
    if (position == ioElement.attributes.size()) ioElement.attributes.emplace_back();
    AttributeShape& shape = ioElement.attributes[position];
    if (shape.name != nullptr && IsNext(at, *shape.name) && at[shape.name->utf8.size()] == '=') {
      at += shape.name->utf8.size();
    } else {
      const char* const nameEnd = NameEnd(at);
      Name& name = FindName(at, nameEnd);
      if (shape.name != &name) shape = {&name, {}};
      at = AfterBlanks(nameEnd);
    }
    if (shape.name->element == element) throw NeedsFullScanner();  // it has the attribute twice
    shape.name->element = element;
    if (*at != '=') Stop(at);
    at = AfterBlanks(at + 1);
    const TextRef value = ReadValue(at, shape.values);
    attributes_.push_back({value, shape.name->number, 0});
  }
}

// A value that is not as it is written: with references, other white space or beyond ASCII.
TextRef Utf8FastPath::ReadSpecialValue(const char*& ioPlace, const char* inSpecial) {
  const char quote = *ioPlace;
  const char* const value = ioPlace + 1;
  const char* at = inSpecial;
  text_.clear();
  AppendAscii(value, at);
  while (*at != quote) {
    if (*at == '<') Stop(at);
    if (*at == '&') {
      at = AppendReference(at);
    } else if (IsBlank(*at)) {  // normalised; a line end of two is one
      at += at[0] == '\r' && at[1] == '\n' ? 2 : 1;
      text_ += u' ';
    } else {
      at = AppendCharacter(at);
    }
    const char* const plain = search_.EndOfValue(at, quote);
    AppendAscii(at, plain);
    at = plain;
  }
  ioPlace = at + 1;
  return tree_.AddText(std::u16string_view(text_));
}

void Utf8FastPath::ReadEndTag() {
  if (open_.size() == 1) throw NeedsFullScanner();
  const OpenElement& element = open_.back();
  const char* at = at_ + 2;
  if (!IsNext(at, *element.name)) {
    if (end_ - at <= static_cast<std::ptrdiff_t>(element.name->utf8.size())) Stop(end_);
    throw NeedsFullScanner();
  }
  at = AfterBlanks(at + element.name->utf8.size());
  if (*at != '>') Stop(at);
  at_ = at + 1;
  tree_.EndChildren(element.node, element.lastChild);
  open_.pop_back();
}

// ---- names

const char* Utf8FastPath::NameEnd(const char* inPlace) const {
  const char first = *inPlace;
  if (first == '-' || first == '.' || (first >= '0' && first <= '9')) Stop(inPlace);
  const char* at = search_.EndOfName(inPlace);
  while (static_cast<signed char>(*at) < 0) {
    char32_t character = 0;
    const int bytes = DecodeUtf8Character(at, character);
    if (bytes == 0 || character > 0xFFFF) Stop(at);
    if (at == inPlace ? !IsNameStart(character) : !IsNameCharacter(character)) Stop(at);
    at = search_.EndOfName(at + bytes);
  }
  if (at == inPlace || at == end_) Stop(at);
  return at;
}

Utf8FastPath::Name& Utf8FastPath::FindName(const char* inPlace, const char* inEnd) {
  const auto length = static_cast<std::size_t>(inEnd - inPlace);
  const std::uint64_t hash = ZORFoundation::HashOfBytes(inPlace, length);
  const std::size_t mask = slots_.size() - 1;
  std::size_t slot = hash & mask;
  for (; slots_[slot] != nullptr; slot = (slot + 1) & mask) {
    Name& known = *slots_[slot];
    if (known.hash == hash && known.utf8.size() == length &&
        ZORFoundation::AreSameBytes(inPlace, known.utf8.data(), length))
      return known;
  }
  text_.clear();
  for (const char* at = inPlace; at != inEnd;) at = AppendCharacter(at);
  names_.push_back(std::make_unique<Name>());
  Name& name = *names_.back();
  name.number = tree_.InternName(text_);
  name.utf8.assign(inPlace, inEnd);
  name.start = NameStart(name.utf8);
  name.hash = hash;
  slots_[slot] = &name;
  if (names_.size() * 2 > slots_.size()) GrowNames();
  return name;
}

void Utf8FastPath::GrowNames() {
  slots_.assign(slots_.size() * 2, nullptr);
  const std::size_t mask = slots_.size() - 1;
  for (const std::unique_ptr<Name>& name : names_) {
    std::size_t slot = name->hash & mask;
    while (slots_[slot] != nullptr) slot = (slot + 1) & mask;
    slots_[slot] = name.get();
  }
}

// ---- text

void Utf8FastPath::AppendNode(int inKind, DOM_Tree::Name inName, TextRef inText) {
  OpenElement& parent = open_.back();
  parent.lastChild = tree_.AppendNew(parent.node, parent.lastChild, inKind, inName, inText);
}

void Utf8FastPath::ReadText() {
  const char* at = search_.EndOfText(at_);
  if (*at == '<') {
    const std::string_view text(at_, static_cast<std::size_t>(at - at_));
    AppendNode(DOM_Node::TEXT_NODE, 0, tree_.AddText(text, open_.back().NextTexts()));
    at_ = at;
    return;
  }
  text_.clear();
  AppendAscii(at_, at);
  while (*at != '<') {
    if (*at == '&') {
      at = AppendReference(at);
      continue;
    }
    if (*at == ']' && at[1] == ']' && at[2] == '>') throw NeedsFullScanner();
    at = AppendCharacter(at);
    const char* const plain = search_.EndOfText(at);
    AppendAscii(at, plain);
    at = plain;
  }
  AppendNode(DOM_Node::TEXT_NODE, 0, tree_.AddText(std::u16string_view(text_)));
  at_ = at;
}

void Utf8FastPath::AppendAscii(const char* inPlace, const char* inEnd) {
  const std::size_t before = text_.size();
  const auto count = static_cast<std::size_t>(inEnd - inPlace);
  text_.resize(before + count);
  WidenLatin1({inPlace, count}, text_.data() + before);
}

// Line ends become line feeds.
const char* Utf8FastPath::AppendCharacter(const char* inPlace) {
  const char byte = *inPlace;
  if (byte == '\r') {
    text_ += u'\n';
    return inPlace + (inPlace[1] == '\n' ? 2 : 1);
  }
  if (static_cast<signed char>(byte) >= 0) {
    if (byte < ' ' && byte != '\t' && byte != '\n') Stop(inPlace);
    text_ += static_cast<char16_t>(byte);
    return inPlace + 1;
  }
  char32_t character = 0;
  const int bytes = DecodeUtf8Character(inPlace, character);
  if (bytes == 0 || !IsXMLCharacter(character)) Stop(inPlace);
  AppendUtf16(character, text_);
  return inPlace + bytes;
}

const char* Utf8FastPath::AppendReference(const char* inPlace) {
  struct Predefined {
    std::string_view text;
    char16_t unit;
  };
  constexpr Predefined kPredefined[] = {
      {"&lt;", u'<'}, {"&gt;", u'>'}, {"&amp;", u'&'}, {"&quot;", u'"'}, {"&apos;", u'\''}};
  for (const Predefined& one : kPredefined) {
    if (!IsTextAt(inPlace, one.text)) continue;
    text_ += one.unit;
    return inPlace + one.text.size();
  }
  if (inPlace[1] != '#') Stop(inPlace);
  const int base = inPlace[2] == 'x' ? 16 : 10;
  const char* at = inPlace + (base == 16 ? 3 : 2);
  if (DigitOf(*at, base) < 0) Stop(at);
  char32_t character = 0;
  for (int digit = DigitOf(*at, base); digit >= 0; digit = DigitOf(*++at, base)) {
    character = character * static_cast<char32_t>(base) + static_cast<char32_t>(digit);
    if (character > 0x10FFFF) throw NeedsFullScanner();
  }
  if (*at != ';') Stop(at);
  if (!IsXMLCharacter(character)) throw NeedsFullScanner();
  AppendUtf16(character, text_);
  return at + 1;
}

// ---- the rest

void Utf8FastPath::ReadComment() {
  const char* at = at_ + 4;
  if (at_[3] != '-') Stop(at_);
  text_.clear();
  while (at[0] != '-' || at[1] != '-') at = AppendCharacter(at);
  if (at[2] != '>') Stop(at);
  AppendNode(DOM_Node::COMMENT_NODE, 0, tree_.AddText(std::u16string_view(text_)));
  at_ = at + 3;
}

void Utf8FastPath::ReadSection() {
  constexpr std::string_view kStart = "<![CDATA[";
  if (open_.size() == 1 || !IsTextAt(at_, kStart)) Stop(at_);
  const char* at = at_ + kStart.size();
  text_.clear();
  while (at[0] != ']' || at[1] != ']' || at[2] != '>') at = AppendCharacter(at);
  AppendNode(DOM_Node::CDATA_SECTION_NODE, 0, tree_.AddText(std::u16string_view(text_)));
  at_ = at + 3;
}

void Utf8FastPath::ReadInstruction() {
  const char* const target = at_ + 2;
  const char* at = NameEnd(target);
  const DOM_Tree::Name name = FindName(target, at).number;
  if (IsReservedTarget(tree_.NameUnits(name))) throw NeedsFullScanner();
  if (!IsBlank(*at) && *at != '?') Stop(at);
  const bool hasData = IsBlank(*at);
  at = AfterBlanks(at);
  text_.clear();
  while (at[0] != '?' || at[1] != '>') {
    if (!hasData) Stop(at);
    at = AppendCharacter(at);
  }
  AppendNode(DOM_Node::PROCESSING_INSTRUCTION_NODE, name,
             tree_.AddText(std::u16string_view(text_)));
  at_ = at + 2;
}
