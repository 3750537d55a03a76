#include "RandomXML.h"

#include <span>
#include <string_view>
#include <vector>

#include "support/EncodedText.h"

namespace {

using Pieces = std::span<const char* const>;

constexpr const char* kNames[] = {"a",  "b",   "item", "Interference",         "x-1",
                                  "_u", "p:q", "n.1",  "\xC3\xA9l\xC3\xA9ment"};
constexpr const char* kAttributeNames[] = {"k", "Name", "x:y", "_", "d", "n", "i", "f", "\xC3\xBC"};
constexpr const char* kWideNames[] = {"\xE9\x83\xA8\xE5\x93\x81", "\xCE\xA9m"};

// Safe in texts and, but for the quotes, in attributes.
constexpr const char* kText[] = {"t",         "words and more words",
                                 " ",         "\n",
                                 "\r\n",      "\r",
                                 "\t",        "  \n    ",
                                 "&lt;",      "&amp;",
                                 "&gt;",      "&quot;",
                                 "&apos;",    "&#65;",
                                 "&#x20AC;",  "&#13;",
                                 "&#10;",     "&#9;",
                                 "&#x1F600;", "\xC3\xA9",
                                 "0",         "1,5",
                                 "]",         "a > b",
                                 "=",         "/",
                                 "%",         ";",
                                 "#",         "&#32;",
                                 "-",         "--",
                                 "?",         "!",
                                 "NO"};
constexpr const char* kWideText[] = {"\xE9\x83\xA8", "\xF0\x9F\x98\x80", "\xEF\xBF\xBD",
                                     "\xE2\x80\xA8"};
constexpr const char* kVerbatim[] = {"c",  " <a> ", "&amp;", "\n",  "\r\n", "\t",  "]]",
                                     "]>", "'",     "\"",    "%p;", "= ",   "<![", ";"};
constexpr const char* kWhitespace[] = {"\n", " ", "\t", "\r\n", "", "", "\n  "};

struct Entity {
  const char* name;
  const char* declaration;
  bool isForAttributes;
};
constexpr Entity kEntities[] = {
    {"plain", "<!ENTITY plain 'plain text'>", true},
    {"none", "<!ENTITY none ''>", true},
    {"mark", "<!ENTITY mark \"1 &#38;lt; 2 &#38;amp; &#10;3\">", true},
    {"deep", "<!ENTITY plain 'x'><!ENTITY deep \"[&plain;&plain;]\">", true},
    {"node", "<!ENTITY node '<c k=\"v\"/>t<c>u</c>'>", false},
    {"rich", "<!ENTITY rich \"<!-- c --><?p d?><![CDATA[s]]><b>&#38;#233;</b>\n\">", false},
};

constexpr const char* kDeclarations[] = {
    "<!ELEMENT a ANY>",
    "<!ELEMENT b EMPTY>",
    "<!ELEMENT item (a,b?,(x-1|_u)*)+>",
    "<!ELEMENT x-1 (#PCDATA|a|b)*>",
    "<!ATTLIST a d CDATA 'dv &lt; &#233;' n NMTOKENS ' x  y ' i (u|v) 'u'>",
    "<!ATTLIST b d CDATA #IMPLIED f CDATA #FIXED 'ff' k ID #IMPLIED>",
    "<!ATTLIST item Name NMTOKEN #REQUIRED>\n",
    "<!NOTATION gif PUBLIC 'g'>",
    "<!ENTITY picture SYSTEM 'p.gif' NDATA gif>",
    "<!ENTITY away SYSTEM 'away.xml'>",
    "<!ENTITY % p '<!ELEMENT p:q ANY>'> %p;",
    "<!-- declared -->",
    "<?subset data?>",
    "\n  ",
};

/// Writes one document.
class Writer {
 public:
  explicit Writer(std::mt19937& ioRandom) : random_(ioRandom) {}

  std::string Write() {
    const unsigned int encoding = Below(8);
    isWide_ = encoding != 0;
    WriteDeclaration(encoding == 0 ? "ISO-8859-1" : encoding == 1 ? "UTF-16" : "");
    WriteMisc();
    const char* const root = Name();
    if (Below(3) == 0) WriteDoctype(root);
    WriteElement(root, 0);
    WriteMisc();
    if (encoding == 0) return support::Encoded(text_, "ISO-8859-1");
    if (encoding == 1) return support::Encoded("\xEF\xBB\xBF" + text_, OneOf(kUtf16));
    return Below(8) == 0 ? "\xEF\xBB\xBF" + text_ : text_;
  }

 private:
  static constexpr const char* kUtf16[] = {"UTF-16LE", "UTF-16BE"};
  static constexpr unsigned int kDeepest = 4;

  unsigned int Below(unsigned int inEnd) { return static_cast<unsigned int>(random_()) % inEnd; }
  const char* OneOf(Pieces inPieces) {
    return inPieces[Below(static_cast<unsigned int>(inPieces.size()))];
  }
  const char* Name() { return isWide_ && Below(6) == 0 ? OneOf(kWideNames) : OneOf(kNames); }

  void WriteDeclaration(const std::string& inEncoding) {
    if (inEncoding.empty() && Below(2) == 0) return;
    text_ += Below(30) == 0 ? "<?xml version='1.1'" : "<?xml version=\"1.0\"";
    if (!inEncoding.empty()) text_ += " encoding=\"" + inEncoding + "\"";
    if (inEncoding.empty() && Below(2) == 0) text_ += " encoding='utf-8' ";
    if (Below(4) == 0) text_ += Below(2) == 0 ? " standalone='yes'" : "\tstandalone = \"no\" ";
    text_ += "?>";
  }

  void WriteMisc() {
    for (unsigned int left = Below(3); left > 0; --left) {
      text_ += OneOf(kWhitespace);
      if (Below(4) == 0) WriteComment();
      if (Below(4) == 0) WriteInstruction();
    }
  }

  void WriteComment() {
    text_ += "<!--";
    for (unsigned int left = Below(4); left > 0; --left) text_ += OneOf(kVerbatim);
    text_ += " -->";
  }

  void WriteInstruction() {
    text_ += std::string("<?") + Name();
    if (Below(2) == 0) text_ += std::string(OneOf(kWhitespace)) + " data " + OneOf(kVerbatim);
    text_ += "?>";
  }

  void WriteSection() {
    text_ += "<![CDATA[";
    for (unsigned int left = Below(4); left > 0; --left) {
      const char* const piece = OneOf(kVerbatim);
      // Two pieces together must not end the section.
      text_ += piece;
      text_ += ' ';
    }
    text_ += "]]>";
  }

  void WriteDoctype(const char* inRoot) {
    text_ += std::string("<!DOCTYPE ") + inRoot;
    if (Below(3) == 0) text_ += Below(2) == 0 ? " SYSTEM 's.dtd'" : " PUBLIC \"-//p//\" \"s\"";
    if (Below(6) != 0) WriteSubset();
    text_ += OneOf(kWhitespace);
    text_ += ">";
    WriteMisc();
  }

  void WriteSubset() {
    text_ += " [";
    for (unsigned int left = Below(6); left > 0; --left) text_ += OneOf(kDeclarations);
    for (const Entity& entity : kEntities) {
      if (Below(2) == 0) continue;
      text_ += entity.declaration;
      entities_.push_back(&entity);
    }
    text_ += "]";
  }

  void WriteElement(const char* inName, unsigned int inDepth) {
    text_ += std::string("<") + inName;
    WriteAttributes();
    if (Below(4) == 0) text_ += OneOf(kWhitespace);
    if (Below(3) == 0) {
      text_ += "/>";
      return;
    }
    text_ += ">";
    for (unsigned int left = Below(6); left > 0; --left) WriteContent(inDepth);
    text_ += std::string("</") + inName;
    if (Below(8) == 0) text_ += OneOf(kWhitespace);
    text_ += ">";
  }

  void WriteContent(unsigned int inDepth) {
    switch (Below(10)) {
      case 0:
        return WriteComment();
      case 1:
        return WriteInstruction();
      case 2:
        return WriteSection();
      case 3:
        return WriteReference(false);
      case 4:
      case 5:
      case 6:
        if (inDepth < kDeepest) return WriteElement(Name(), inDepth + 1);
        [[fallthrough]];
      default:
        for (unsigned int left = 1 + Below(4); left > 0; --left) WriteText();
    }
  }

  void WriteText() {
    text_ += isWide_ && Below(6) == 0 ? OneOf(kWideText) : OneOf(kText);
    // Two pieces together must not look like a section's end.
    if (text_.ends_with("]]")) text_ += ' ';
  }

  void WriteReference(bool inIsForAttribute) {
    if (entities_.empty()) return;
    const Entity& entity = *entities_[Below(static_cast<unsigned int>(entities_.size()))];
    if (entity.isForAttributes || !inIsForAttribute) text_ += std::string("&") + entity.name + ";";
  }

  // Each name at most once: those from a random one on, in the order of the list or against it.
  void WriteAttributes() {
    constexpr unsigned int kCount = std::size(kAttributeNames);
    const unsigned int first = Below(kCount);
    const unsigned int step = Below(2) == 0 ? 1 : kCount - 1;
    const unsigned int count = Below(2) == 0 ? 0 : Below(5);
    for (unsigned int i = 0; i < count; ++i)
      WriteAttribute(kAttributeNames[(first + i * step) % kCount]);
  }

  void WriteAttribute(const char* inName) {
    const char quote = Below(4) == 0 ? '\'' : '"';
    text_ += OneOf(kWhitespace);
    text_ += std::string(" ") + inName;
    text_ += Below(8) == 0 ? " =\n" : "=";
    text_ += quote;
    for (unsigned int left = Below(4); left > 0; --left) {
      if (Below(8) == 0)
        WriteReference(true);
      else
        WriteText();
    }
    text_ += quote;
  }

  std::mt19937& random_;
  std::string text_;
  bool isWide_ = true;
  std::vector<const Entity*> entities_;  // declared by this document
};

using namespace std::string_view_literals;
constexpr std::string_view kMeaningful[] = {"<",
                                            ">",
                                            "&",
                                            ";",
                                            "'",
                                            "\"",
                                            "%",
                                            "!",
                                            "[",
                                            "]",
                                            "(",
                                            ")",
                                            "-",
                                            "?",
                                            "/",
                                            "=",
                                            " ",
                                            "\n",
                                            "a",
                                            "#",
                                            "]]>",
                                            "--",
                                            "<!--",
                                            "-->",
                                            "<?",
                                            "?>",
                                            "<a>",
                                            "</a>",
                                            "<![CDATA[",
                                            "&#0;",
                                            "&x;",
                                            "&#x;",
                                            "<?xml",
                                            "\r\n",
                                            ":",
                                            "&amp;",
                                            "&lt",
                                            "<!DOCTYPE a>",
                                            "xmlns",
                                            "k='v'",
                                            "\0"sv,
                                            "\xFF",
                                            "\xC3",
                                            "\xE9\x83",
                                            "\x01",
                                            "\xEF\xBF\xBE",
                                            "\xED\xA0\x80",
                                            "\xF4\x90\x80\x80"};

}  // namespace

std::string RandomDocument(std::mt19937& ioRandom) { return Writer(ioRandom).Write(); }

std::string Damaged(const std::string& inText, std::mt19937& ioRandom) {
  std::string text = inText;
  for (std::size_t left = 1 + ioRandom() % 3; left > 0 && !text.empty(); --left) {
    const std::size_t at = ioRandom() % text.size();
    switch (ioRandom() % 6) {
      case 0:
        text[at] = static_cast<char>(ioRandom());
        break;
      case 1:
        text.erase(at, 1 + ioRandom() % 6);
        break;
      case 2:
        text.insert(at, text.substr(ioRandom() % text.size(), ioRandom() % 20));
        break;
      case 3:
        text.erase(ioRandom() % 8 == 0 ? at : text.size());
        break;
      case 4:
        text[at] = "<>&;'\"%![]()-?/ =:"[ioRandom() % 19];
        break;
      default:
        text.insert(at, kMeaningful[ioRandom() % std::size(kMeaningful)]);
    }
  }
  return text.empty() ? "<" : text;  // nothing at all is read, as a document without root
}
