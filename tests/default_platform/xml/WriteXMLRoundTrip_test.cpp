// What is written reads back as an equal tree: random trees, and all samples.
#include <gtest/gtest.h>

#include <filesystem>
#include <random>
#include <vector>

#include "support/TreeEquality.h"

using support::ParseText;
using support::TreeDifference;
using support::WrittenText;

namespace {

/// Makes random trees that a text can carry as they are: no neighbouring or empty texts, no section
/// that has to be split.
class RandomTrees {
 public:
  explicit RandomTrees(unsigned int inSeed) : random_(inSeed) {}

  DOM_Document Make() {
    DOM_Document document = DOM_Document::createDocument();
    AddMiscellaneous(document);
    DOM_Element root = document.createElement(Name());
    document.appendChild(root);
    AddMiscellaneous(document);
    std::vector<DOM_Node> elements{root};
    const std::size_t count = Below(60);
    for (std::size_t i = 0; i < count; ++i) AddChild(document, elements);
    for (DOM_Node& element : elements) AddAttributes(element);
    return document;
  }

 private:
  std::size_t Below(std::size_t inEnd) { return random_() % inEnd; }

  DOMString Name() {
    static const char* const names[] = {
        "a", "b:c", "_d", "e-1.2", "\xC3\xA9t\xC3\xA9", "\xE9\x83\xA8\xE5\x93\x81", "Interference"};
    return names[Below(7)];
  }

  DOMString Characters(std::u16string_view inAlphabet) {
    std::u16string text;
    const std::size_t count = Below(12);
    for (std::size_t i = 0; i < count; ++i) {
      const char16_t unit = inAlphabet[Below(inAlphabet.size())];
      text += unit;
      if (unit >= 0xD800 && unit < 0xDC00) text += static_cast<char16_t>(0xDC00 + Below(0x400));
    }
    return DOMString(text.data(), static_cast<unsigned int>(text.size()));
  }
  // Everything that has a meaning somewhere, and the first and last characters of every range. A
  // first half of a pair is given its second one.
  DOMString AnyCharacters() {
    return Characters(
        u"&&<<>>\"\"''\t\n\r  ]]>>[!-?abc0;#x\x7F\u0080\u0085\u00E9\u2028\u90E8\uD7FF\xD800\xDBFF"
        u"\xE000\uFEFF\uFFFD");
  }
  DOMString PlainCharacters() { return Characters(u"abc &<>\"']\t\n\u00E9\xD83D"); }

  void AddMiscellaneous(DOM_Document& ioDocument) {
    while (Below(3) == 0)
      ioDocument.appendChild(
          Below(2) == 0
              ? ioDocument.createComment(Characters(u"abc<>&]\n\u00E9"))
              : ioDocument.createProcessingInstruction(Name(), Characters(u"abc<>&]\u90E8")));
  }

  void AddChild(DOM_Document& ioDocument, std::vector<DOM_Node>& ioElements) {
    DOM_Node parent = ioElements[Below(ioElements.size())];
    const bool isAfterText = parent.getLastChild().getNodeType() == DOM_Node::TEXT_NODE;
    switch (Below(6)) {
      case 0:
      case 1:
        ioElements.push_back(parent.appendChild(ioDocument.createElement(Name())));
        return;
      case 2:
      case 3: {
        const DOMString text = AnyCharacters();
        if (!isAfterText && text.length() != 0) parent.appendChild(ioDocument.createTextNode(text));
        return;
      }
      case 4:
        parent.appendChild(ioDocument.createComment(Characters(u"abc<>&]\n\u00E9")));
        return;
      default: {
        const DOM_Node section = ioDocument.createCDATASection(PlainCharacters());
        if (WrittenText(section).find("]]>") == WrittenText(section).size() - 3)
          parent.appendChild(section);
      }
    }
  }

  void AddAttributes(DOM_Node& ioElement) {
    const std::size_t count = Below(4);
    for (std::size_t i = 0; i < count; ++i)
      DOM_Element(ioElement).setAttribute(Name(), AnyCharacters());
  }

  std::mt19937 random_;
};

}  // namespace

TEST(WriteXMLRoundTrip, RandomTreesReadBackEqual) {
  RandomTrees trees(20261120);
  for (int i = 0; i < 3000; ++i) {
    const DOM_Document document = trees.Make();
    const std::string text = WrittenText(document);
    ASSERT_EQ(TreeDifference(document, ParseText(text)), "") << text;
  }
}

TEST(WriteXMLRoundTrip, SplitSectionsKeepTheirCharacters) {
  std::mt19937 random(3);
  for (int i = 0; i < 2000; ++i) {
    std::string content;
    for (std::size_t j = random() % 12; j > 0; --j) content += "]]>>]\rx"[random() % 7];
    DOM_Document document = ParseText("<a/>");
    document.getDocumentElement().appendChild(document.createCDATASection(content.c_str()));
    const DOM_Element root = support::RootOf(WrittenText(document));
    std::string read;
    for (DOM_Node at = root.getFirstChild(); !at.isNull(); at = at.getNextSibling())
      read += support::Narrow(at.getNodeValue());
    ASSERT_EQ(read, content);
  }
}

TEST(WriteXMLRoundTrip, AllSamplesReadBackEqual) {
  int samples = 0;
  for (const auto& entry : std::filesystem::directory_iterator(ZOR_SOURCE_DIR "/samples")) {
    const std::string path = entry.path().string();
    if (!path.ends_with(".clash.xml")) continue;
    DOMParser parser;
    parser.parse(path.c_str());
    const std::string text = WrittenText(parser.getDocument());
    EXPECT_EQ(TreeDifference(parser.getDocument(), ParseText(text)), "") << path;
    ++samples;
  }
  EXPECT_GT(samples, 0);
}
