// Input that means harm: never a crash, a hang, a flood or a file opened.
#include <gtest/gtest.h>
#include <pthread.h>
#ifndef _WIN32
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>
#endif

#include <functional>
#include <random>
#include <string>
#include <thread>

#include "platform/xml/DOM_NodeList.h"
#include "support/PlatformFolder.h"
#include "support/TreeEquality.h"

using support::FileErrorOf;
using support::ParseErrorOf;
using support::ParseText;
using support::RootOf;
using support::TemporaryFolder;
using support::WrittenText;

namespace {

std::string Repeated(const std::string& inText, std::size_t inCount) {
  std::string text;
  text.reserve(inText.size() * inCount);
  for (std::size_t i = 0; i < inCount; ++i) text += inText;
  return text;
}

#ifdef _WIN32
/// Without a limit: Windows makes no copy of a process.
int RunLimited(unsigned int /*inSeconds*/, std::size_t /*inMegabytes*/,
               const std::function<bool()>& inWork) {
  return inWork() ? 0 : 1;
}
#else
#if defined(__SANITIZE_ADDRESS__)
constexpr bool kHasShadowMemory = true;
#else
constexpr bool kHasShadowMemory = false;
#endif

/// Runs something in a process of its own that may use so many seconds and so much more memory.
/// @return 0 when it answered true in these limits.
int RunLimited(unsigned int inSeconds, std::size_t inMegabytes,
               const std::function<bool()>& inWork) {
  const pid_t child = fork();
  if (child == 0) {
    const rlimit time{inSeconds, inSeconds + 1};
    setrlimit(RLIMIT_CPU, &time);
    rlimit memory{};
    if (!kHasShadowMemory) {  // which by itself takes terabytes of addresses
      std::size_t pages = 0;
      std::ifstream("/proc/self/statm") >> pages;
      const std::size_t used = pages * static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
      memory.rlim_cur = memory.rlim_max = used + inMegabytes * 1024 * 1024;
      setrlimit(RLIMIT_AS, &memory);
    }
    _exit(inWork() ? 0 : 1);
  }
  int status = 0;
  waitpid(child, &status, 0);
  return status;
}
#endif

/// Runs something on a thread with a small stack.
void RunOnSmallStack(void* (*inWork)(void*)) {
  pthread_attr_t attributes;
  pthread_attr_init(&attributes);
  ASSERT_EQ(pthread_attr_setstacksize(&attributes, std::size_t{256} * 1024), 0);
  pthread_t thread;
  ASSERT_EQ(pthread_create(&thread, &attributes, inWork, nullptr), 0);
  pthread_join(thread, nullptr);
  pthread_attr_destroy(&attributes);
}

std::string LaughingEntities() {
  std::string text = "<!DOCTYPE l [<!ENTITY l0 \"lol\">";
  for (int i = 1; i <= 10; ++i)
    text += "<!ENTITY l" + std::to_string(i) + " \"" +
            Repeated("&l" + std::to_string(i - 1) + ";", 10) + "\">";
  return text + "]>";
}

}  // namespace

// ---- floods

TEST(HostileInput, EntitiesThatMultiplyInContentAreRefusedQuickly) {
  const std::string text = LaughingEntities() + "<l>&l10;</l>";
  EXPECT_EQ(
      RunLimited(5, 100, [&] { return ParseErrorOf(text).find("50000") != std::string::npos; }), 0);
}

TEST(HostileInput, EntitiesThatMultiplyInAttributesAreRefusedQuickly) {
  const std::string text = LaughingEntities() + "<l a='&l10;'/>";
  EXPECT_EQ(RunLimited(5, 100, [&] { return !ParseErrorOf(text).empty(); }), 0);
}

TEST(HostileInput, EntityThatContainsItselfIsRefused) {
  EXPECT_NE(ParseErrorOf("<!DOCTYPE a [<!ENTITY e '&f;'><!ENTITY f '&e;'>]><a>&e;</a>"), "");
}

TEST(HostileInput, LargeEntityUsedOftenIsRefused) {
  const std::string declared = "<!DOCTYPE l [<!ENTITY e \"" + std::string(1000000, 'x') + "\">]>";
  const std::string uses = Repeated("&e;", 40000);
  EXPECT_EQ(
      RunLimited(10, 300, [&] { return !ParseErrorOf(declared + "<l>" + uses + "</l>").empty(); }),
      0);
  EXPECT_NE(ParseErrorOf(declared + "<l a='" + uses + "'/>"), "");
}

TEST(HostileInput, LargeDefaultAttributeUsedOftenIsRefused) {
  const std::string text = "<!DOCTYPE r [<!ATTLIST a x CDATA '" + std::string(100000, 'v') +
                           "'>]><r>" + Repeated("<a/>", 100000) + "</r>";
  EXPECT_EQ(RunLimited(10, 300, [&] { return !ParseErrorOf(text).empty(); }), 0);
}

TEST(HostileInput, ModestEntitiesAreNoFlood) {
  const std::string text = "<!DOCTYPE r [<!ENTITY company 'Example and Sons'>]><r>" +
                           Repeated("<a b='&company;'>&company;</a>", 10000) + "</r>";
  EXPECT_EQ(ParseErrorOf(text), "");
}

TEST(HostileInput, ParameterEntitiesThatMultiplyAreRefusedQuickly) {
  std::string text = "<!DOCTYPE r [<!ENTITY % p0 ''>";
  for (int i = 1; i <= 10; ++i)
    text += "<!ENTITY % p" + std::to_string(i) + " \"" +
            Repeated("&#37;p" + std::to_string(i - 1) + ";", 10) + "\">";
  text += " %p10; ]><r/>";
  EXPECT_EQ(
      RunLimited(
          10, 200,
          [&] { return ParseErrorOf(text).find("more than 60,000 times") != std::string::npos; }),
      0);
}

TEST(HostileInput, ParameterEntitiesThatMultiplyDeclarationsAreRefusedInBoundedMemory) {
  std::string text = "<!DOCTYPE r [<!ENTITY % p0 '<!--" + std::string(2000, 'x') + "-->'>";
  for (int i = 1; i <= 4; ++i)
    text += "<!ENTITY % p" + std::to_string(i) + " \"" +
            Repeated("&#37;p" + std::to_string(i - 1) + ";", 10) + "\">";
  text += " %p4; ]><r/>";
  EXPECT_EQ(
      RunLimited(10, 200,
                 [&] { return ParseErrorOf(text).find("too much text") != std::string::npos; }),
      0);
}

TEST(HostileInput, ParameterEntitiesInModestNumbersAreNoFlood) {
  EXPECT_EQ(
      ParseErrorOf("<!DOCTYPE r [<!ENTITY % p '<!--c-->'>" + Repeated("%p;", 5000) + "]><r/>"), "");
}

TEST(HostileInput, ManyAttributesAreReadInLinearTime) {
  std::string attributes;
  for (int i = 0; i < 100'000; ++i) attributes += " n" + std::to_string(i) + "='v'";
  for (const char* const before : {"<a", "<!DOCTYPE a><a"}) {
    const std::string text = before + attributes;
    EXPECT_EQ(RunLimited(10, 300, [&] { return ParseErrorOf(text + "/>").empty(); }), 0);
    EXPECT_EQ(RunLimited(10, 300, [&] { return !ParseErrorOf(text + " n7='w'/>").empty(); }), 0);
  }
}

TEST(HostileInput, BytesBeyondUnicodeAreRefused) {
  for (const std::string& bytes :
       {std::string("\xF5\x80\x80\x80"), std::string("\xF6\xBF\xBF\xBF"),
        std::string("\xF7\x80\x80\x80"), std::string("\xF4\x90\x80\x80")})
    for (const char* const before : {"", "\xEF\xBB\xBF", "<?xml version='1.0' encoding='UTF-8'?>",
                                     "<?xml version='1.0' encoding='utf8'?>", "<!DOCTYPE a>"}) {
      const std::string error = ParseErrorOf(before + std::string("<a b='") + bytes + "B'/>");
      EXPECT_EQ(error.find("LIDPipodIBM:1:"), 0u) << before << error;
    }
  EXPECT_EQ(ParseErrorOf("<?xml version='1.0' encoding='ISO-8859-1'?><a b='\xF5\xF6\xF7'/>"), "");
}

TEST(HostileInput, AttributeOfOneGigabyteIsRefusedInBoundedMemory) {
  const TemporaryFolder folder;
  const std::string path = folder.FilePath("huge.xml");
  {
    std::ofstream file(path, std::ios::binary);
    file << "<a x=\"";
    const std::string part(1 << 20, 'y');
    for (int i = 0; i < 1024; ++i) file << part;
    file << "\"/>";
  }
  EXPECT_EQ(RunLimited(60, 1000,
                       [&] {
                         const std::string error = FileErrorOf(path);
                         return error.find(path + ":1:") == 0 &&
                                error.find("too large") != std::string::npos;
                       }),
            0);
}

TEST(HostileInput, ManyDeclaredNamesDoNotExhaustTheStack) {
  static std::string text;
  text = "<!DOCTYPE l [<!ELEMENT a (n0";
  for (int i = 1; i < 100000; ++i) text += "|n" + std::to_string(i);
  text += ")>]><l/>";
  RunOnSmallStack([](void*) -> void* {
    const DOM_Document document = ParseText(text);
    EXPECT_EQ(WrittenText(document), text);
    return nullptr;
  });
}

// ---- nesting

TEST(HostileInput, DeepNestingIsLoadedWalkedCopiedWrittenAndReleased) {
  RunOnSmallStack([](void*) -> void* {
    constexpr std::size_t kDepth = 100000;
    const std::string text = Repeated("<a>", kDepth - 1) + "<a/>" + Repeated("</a>", kDepth - 1);
    DOM_Document document = ParseText(text);
    std::size_t depth = 0;
    for (DOM_Node at = document.getDocumentElement(); !at.isNull(); at = at.getChildNodes().item(0))
      ++depth;
    EXPECT_EQ(depth, kDepth);
    DOM_Node copy = document.getDocumentElement().cloneNode(true);
    depth = 0;
    for (DOM_Node at = copy; !at.isNull(); at = at.getFirstChild()) ++depth;
    EXPECT_EQ(depth, kDepth);
    EXPECT_EQ(support::TreeDifference(document.getDocumentElement(), copy), "");
    EXPECT_EQ(WrittenText(copy), text);
    copy = DOM_Node();
    DOM_Document other = ParseText("<z/>");
    DOM_Node imported = other.importNode(document.getDocumentElement(), true);
    document = DOM_Document();
    EXPECT_EQ(WrittenText(imported), text);
    other.getDocumentElement().appendChild(imported);
    return nullptr;
  });
}

TEST(HostileInput, DeepTreeBuiltFromOutsideAndInside) {
  RunOnSmallStack([](void*) -> void* {
    DOM_Document document = DOM_Document::createDocument();
    DOM_Node inner = document.createElement("a");
    DOM_Node outer = inner;
    for (int i = 0; i < 50000; ++i) {
      inner = inner.appendChild(document.createElement("i"));
      DOM_Node next = document.createElement("o");
      next.appendChild(outer);
      outer = next;
    }
    document.appendChild(outer);
    EXPECT_EQ(WrittenText(document).size(), std::size_t{100000} * 7 + 4);
    return nullptr;
  });
}

TEST(HostileInput, NestingWithoutEndIsRefused) {
  EXPECT_EQ(ParseErrorOf(Repeated("<a>", 1200000)),
            "LIDPipodIBM:1:3000004: elements are nested deeper than 1,000,000");
}

// ---- what lies outside

TEST(HostileInput, ExternalEntityIsNotOpened) {
  const TemporaryFolder folder;
  folder.WriteFile("secret.txt", "secret");
  for (const std::string& id :
       {folder.FilePath("secret.txt"), "file://" + folder.FilePath("secret.txt"),
        std::string("http://127.0.0.1:9/secret"), std::string("ftp://127.0.0.1:9/secret")}) {
    const std::string text = "<!DOCTYPE a [<!ENTITY e SYSTEM '" + id + "'>]>\n<a>&e;</a>";
    const std::string error = ParseErrorOf(text);
    EXPECT_NE(error.find("external entities are not opened"), std::string::npos) << error;
    EXPECT_EQ(error.find("LIDPipodIBM:2:"), 0u) << error;
  }
}

TEST(HostileInput, ExternalParameterEntityIsNotOpened) {
  const std::string error =
      ParseErrorOf("<!DOCTYPE a [<!ENTITY % e SYSTEM 'http://127.0.0.1:9/x.dtd'> %e;]><a/>");
  EXPECT_NE(error.find("external entities are not opened"), std::string::npos) << error;
}

TEST(HostileInput, ExternalEntityThatIsOnlyDeclaredDoesNoHarm) {
  EXPECT_EQ(ParseErrorOf("<!DOCTYPE a [<!ENTITY e SYSTEM '/etc/hostname'>]><a/>"), "");
}

TEST(HostileInput, FoldersAndPipesAreRefusedAtOnce) {
  const TemporaryFolder folder;
  EXPECT_EQ(FileErrorOf(folder.path.string()), folder.path.string() + ": is a directory");
#ifndef _WIN32
  const std::string pipe = folder.FilePath("pipe");
  ASSERT_EQ(mkfifo(pipe.c_str(), 0600), 0);
  EXPECT_EQ(FileErrorOf(pipe), pipe + ": is not a regular file");
#endif
  EXPECT_EQ(FileErrorOf("/dev/null"), "/dev/null: is not a regular file");
}

// ---- damage

TEST(HostileInput, EveryTruncationRaisesOrGivesNoRoot) {
  const std::string text =
      "\xEF\xBB\xBF<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<!-- c --><!DOCTYPE a [\n<!ELEMENT "
      "a "
      "(b|c)*>"
      "<!ATTLIST a k CDATA 'v'><!ENTITY e '\xC3\xA9'>]>\n<?p d?><a x=\"1 &amp; \xE9\x83\xA8\">t&e;"
      "<![CDATA[s]]>\n<b y='&#233;'/><!-- d --><?q r?>\xF0\x9F\x98\x80</a>";
  ASSERT_EQ(ParseErrorOf(text), "");
  for (std::size_t length = 0; length < text.size(); ++length) {
    try {
      EXPECT_TRUE(ParseText(std::string_view(text).substr(0, length)).getDocumentElement().isNull())
          << length;
    } catch (const ZORXMLParseError& error) {
      EXPECT_FALSE(error.reason.empty()) << length;
      EXPECT_EQ(std::string(error.what()).find('\n'), std::string::npos) << length;
    }
  }
}

TEST(HostileInput, EveryTruncationOfWideTextRaisesOrGivesNoRoot) {
  const std::u16string wide =
      u"\uFEFF<?xml version=\"1.0\" encoding=\"UTF-16\"?><a k='\u90E8'>\U0001F600<b/></a>";
  const std::string text(reinterpret_cast<const char*>(wide.data()), wide.size() * 2);
  ASSERT_EQ(ParseErrorOf(text), "");
  for (std::size_t length = 0; length < text.size(); ++length) {
    try {
      EXPECT_TRUE(ParseText(std::string_view(text).substr(0, length)).getDocumentElement().isNull())
          << length;
    } catch (const ZORXMLParseError& error) {
      EXPECT_FALSE(error.reason.empty()) << length;
    }
  }
}

// Whatever is read from damaged text must still be a whole tree, which writing and reading shows.
TEST(HostileInput, RandomDamageRaisesOrGivesAWholeTree) {
  const std::string text =
      "<?xml version=\"1.0\"?>\n<!DOCTYPE a [<!ELEMENT a (b,c?)+><!ATTLIST b k (x|y) 'x' l "
      "NMTOKENS "
      "#IMPLIED><!ENTITY e '<c/>t'><!ENTITY % p '<!ELEMENT d ANY>'> %p;]>\n<a x=\"1\">t&e;"
      "<![CDATA[s]]>\n<b k='y'/><!-- d --><?q r?>&#233;&lt;</a>";
  ASSERT_EQ(ParseErrorOf(text), "");
  std::mt19937 random(99);
  int wholeTrees = 0;
  for (int step = 0; step < 8000; ++step) {
    std::string damaged = text;
    for (std::size_t i = 0; i <= random() % 3; ++i) {
      const std::size_t at = random() % damaged.size();
      switch (random() % 4) {
        case 0:
          damaged[at] = static_cast<char>(random());
          break;
        case 1:
          damaged.erase(at, 1 + random() % 5);
          break;
        case 2:
          damaged.insert(at, damaged.substr(random() % damaged.size(), random() % 20));
          break;
        default:
          damaged[at] = "<>&;'\"%![]()-?/ "[random() % 16];
      }
      if (damaged.empty()) break;
    }
    try {
      const DOM_Document document = ParseText(damaged);
      const std::string written = WrittenText(document);
      ASSERT_EQ(support::TreeDifference(document, ParseText(written)), "")
          << damaged << "\n--- was written as\n"
          << written;
      ++wholeTrees;
    } catch (const ZORXMLParseError& error) {
      ASSERT_FALSE(error.reason.empty());
    }
  }
  EXPECT_GT(wholeTrees, 50);
}

TEST(HostileInput, RandomBytesAreRefused) {
  std::mt19937 random(5);
  for (int step = 0; step < 3000; ++step) {
    std::string bytes(1 + random() % 200, '\0');
    for (char& byte : bytes) byte = static_cast<char>(random());
    EXPECT_NE(ParseErrorOf(bytes), "") << step;
  }
}
