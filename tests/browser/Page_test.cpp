// Published pages as a browser shows them, opened as files.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "tools/Command.h"

using testing::HasSubstr;
using testing::Not;

namespace fs = std::filesystem;

namespace {

std::size_t Occurrences(const std::string& inText, const std::string& inPart) {
  std::size_t count = 0;
  for (auto at = inText.find(inPart); at != std::string::npos; at = inText.find(inPart, at + 1))
    ++count;
  return count;
}

/// Timers wait for nothing but files, and end after these milliseconds.
constexpr const char* kVirtualTime = "--virtual-time-budget=5000";

/// A publication that all tests look at, and a browser.
class Page : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    directory_ = new TemporaryDirectory;
    const CommandResult result =
        RunCommand({"publish", "samples/as1.clash.xml", "--model", "samples/as1-oc-214.stp",
                    "--size", "120x80", "-o", directory_->Path("as1")});
    ASSERT_EQ(result.code, 0) << result.error;
    RunCommand({"publish", "samples/dissonance.clash.xml", "--lang", "fr", "-o",
                directory_->Path("dissonance")});
  }
  static void TearDownTestSuite() { delete directory_; }

  static std::string PathOf(const std::string& inName) { return directory_->Path(inName); }
  static std::string Original(const std::string& inFolder) {
    return ReadFile(PathOf(inFolder + "/index.html"));
  }

  /// Runs the browser on a file. The sandbox cannot be had by every user who runs tests.
  static CommandResult Browse(const std::string& inOptions, const std::string& inPath,
                              const std::string& inTime = kVirtualTime) {
    const TemporaryDirectory profile;
    return RunShell("timeout 120 " CHROMIUM
                    " --headless --no-sandbox --disable-gpu --disable-dev-shm-usage"
                    " --enable-logging=stderr --user-data-dir=" +
                    profile.Path("") + " " + inTime + " " + inOptions + " file://" + inPath);
  }

  /// The page after a script has run on it; the script's result is the element "#result". Without
  /// virtual time the script runs until the page is loaded.
  static std::string After(const std::string& inFolder, const std::string& inScript,
                           const std::string& inTime = kVirtualTime) {
    const std::string path = PathOf(inFolder + "/tried.html");
    std::string page = Original(inFolder);
    const std::string end = "</body>";
    page.insert(
        page.rfind(end),
        "<p id=\"result\"></p><script>const say = text => "
        "document.getElementById('result').textContent = text;\n"
        "const numbers = () => [...document.querySelectorAll('tbody tr')]"
        ".filter(row => row.checkVisibility()).map(row => row.dataset.n).join(' ');\n"
        "const header = name => [...document.querySelectorAll('th')]"
        ".find(cell => cell.textContent === name);\n"
        "const choose = (name, value) => { const field = document.forms[0].elements[name];\n"
        "field.value = value; field.dispatchEvent(new Event('input', {bubbles: true})); };\n" +
            inScript + "</script>");
    directory_->Write(inFolder + "/tried.html", page);
    const CommandResult result = Browse("--dump-dom", path, inTime);
    EXPECT_THAT(result.error, Not(HasSubstr("CONSOLE"))) << inScript;
    const std::string start = "<p id=\"result\">";
    const std::size_t from = result.out.find(start);
    if (from == std::string::npos) return "no result: " + result.error;
    return result.out.substr(from + start.size(),
                             result.out.find("</p>", from) - from - start.size());
  }

  /// The text of the page as it is printed.
  static std::string Printed(const std::string& inPath) {
    const std::string pdf = PathOf("printed.pdf");
    Browse("--no-pdf-header-footer --print-to-pdf=" + pdf, inPath);
    return RunShell(PDFTOTEXT " -layout " + pdf + " -").out;
  }

  static TemporaryDirectory* directory_;
};

TemporaryDirectory* Page::directory_ = nullptr;

}  // namespace

TEST_F(Page, OpensWithoutAnyMessage) {
  const CommandResult result = Browse("--dump-dom", PathOf("as1/index.html"));
  EXPECT_EQ(Occurrences(result.out, "<tr data-n="), 32u);
  EXPECT_THAT(result.error, Not(HasSubstr("CONSOLE")));
}

// What shows that a message would be seen.
TEST_F(Page, MessagesOfTheConsoleAreSeen) {
  directory_->Write("broken.html", "<script>console.error('seen')</script>");
  EXPECT_THAT(Browse("--dump-dom", PathOf("broken.html")).error, HasSubstr("CONSOLE"));
}

TEST_F(Page, ColumnIsSortedByClicksBothWays) {
  EXPECT_EQ(After("dissonance",
                  "const values = () => [...document.querySelectorAll('tbody tr')].map(row => "
                  "parseFloat(row.cells[2].textContent.replace(',', '.')));\n"
                  "const isRising = list => list.every((v, i) => i === 0 || list[i - 1] <= v);\n"
                  "const before = isRising(values());\n"
                  "header('Value').firstChild.click(); const up = isRising(values());\n"
                  "header('Value').firstChild.click(); const down = isRising(values().reverse());\n"
                  "say([before, up, down, values().length].join(' '));"),
            "false true true 20");
}

TEST_F(Page, NumbersAreSortedAsNumbers) {
  EXPECT_THAT(After("as1", "header('N').firstChild.click(); say(numbers());"),
              testing::StartsWith("1 2 3 4 5 6 7 8 9 10 11 "));
  EXPECT_THAT(After("as1",
                    "header('N').firstChild.click(); header('N').firstChild.click();"
                    "say(numbers());"),
              testing::StartsWith("32 31 30 "));
}

TEST_F(Page, TypeChoiceHidesTheOthersAndTheirSections) {
  EXPECT_EQ(After("dissonance",
                  "choose('type', 'Contact'); say(numbers().split(' ').length + ' ' + "
                  "[...document.querySelectorAll('section')].filter(s => !s.hidden).length + ' ' + "
                  "document.querySelector('output').value);"),
            "4 4 4 of 20 shown");
}

TEST_F(Page, SearchFindsTextOfARow) {
  EXPECT_EQ(After("as1",
                  "choose('text', 'PLATE'); say([...document.querySelectorAll('tbody tr')]"
                  ".filter(row => !row.hidden).every(row => row.textContent.includes("
                  "'plate')) && numbers() !== '');"),
            "true");
  EXPECT_EQ(After("as1", "choose('text', 'no such product'); say('[' + numbers() + ']');"), "[]");
}

TEST_F(Page, ClickOnAPictureShowsItLarge) {
  EXPECT_EQ(After("as1",
                  "document.querySelector('#i3 a.zoom').click();\n"
                  "say(document.querySelector('dialog').open + ' ' + "
                  "document.querySelector('dialog img').src.split('/').pop());"),
            "true interference_3.jpg");
}

TEST_F(Page, SmallPicturesLoadAndShowLargeByAClick) {
  fs::create_directories(PathOf("system"));
  directory_->Write("system/Clash.toml", "ModeOfSubInterf = 1\n");
  const CommandResult result =
      RunShell("TRX_VELD_SUBINTERF=TRUE ZOR_SETTINGS_PATH=" + PathOf("") +
               " lyra publish samples/as1.clash.xml --model samples/as1-oc-214.stp --only "
               "type=contact,product=nut_1 --size 120x80 --format png -o " +
               PathOf("small"));
  ASSERT_EQ(result.code, 0) << result.error;
  EXPECT_EQ(After("small",
                  "const first = document.querySelector('.thumbnails a');\n"
                  "const probe = new Image();\n"
                  "probe.onload = () => { first.click();\n"
                  "say(probe.naturalWidth + 'x' + probe.naturalHeight + ' ' + "
                  "document.querySelector('dialog img').src.split('/').pop()); };\n"
                  "probe.src = first.href;"),
            "72x50 interference_1_SubItf_1.png");
}

TEST_F(Page, PicturesOfManyArePutInWhereTheyAreSeen) {
  std::string sheet = ReadFile(ZOR_SOURCE_DIR "/resources/clash-page.xsl");
  const std::string limit = "name=\"mostLazy\" select=\"1000\"";
  ASSERT_NE(sheet.find(limit), std::string::npos);
  sheet.replace(sheet.find(limit), limit.size(), "name=\"mostLazy\" select=\"10\"");
  ASSERT_EQ(
      RunCommand({"publish", "samples/as1.clash.xml", "--model", "samples/as1-oc-214.stp", "--size",
                  "60x40", "--xsl", directory_->Write("many.xsl", sheet), "-o", PathOf("many")})
          .code,
      0);
  // What is seen is known after a frame is drawn, which takes its time while virtual time leaps:
  // the page waits instead, with its load held open by one picture after the other.
  EXPECT_EQ(
      After("many",
            "const last = document.querySelector('#i32');\n"
            "const inFirst = () => document.querySelectorAll('tbody tr:first-child img').length;\n"
            "const inLast = () => last.querySelectorAll('img').length;\n"
            "const areFew = () => document.querySelectorAll('main img').length < 128;\n"
            "const start = Date.now();\n"
            "const when = (holds, then) => {\n"
            "  if (holds() || Date.now() - start > 60000) return then();\n"
            "  const image = new Image();\n"
            "  image.onerror = () => when(holds, then);\n"
            "  image.src = 'data:,no picture';\n"
            "};\n"
            "when(inFirst, () => {\n"
            "  const before = [inFirst(), inLast(), areFew()];\n"
            "  last.scrollIntoView();\n"
            "  when(inLast, () => say([...before, inLast(), areFew()]));\n"
            "});",
            ""),
      "1,0,true,3,true");
}

TEST_F(Page, EveryPictureLoads) {
  EXPECT_EQ(
      After("as1",
            "const images = [...document.querySelectorAll('main img')];\n"
            "let left = images.length, good = 0;\n"
            "for (const image of images) {\n"
            "  const probe = new Image();\n"
            "  probe.onload = () => { good += probe.naturalWidth > 0; --left || say(good); };\n"
            "  probe.onerror = () => say('not there: ' + image.src);\n"
            "  probe.src = image.src;\n"
            "}"),
      "128");
}

TEST_F(Page, MarkupOfADocumentDoesNothing) {
  const std::string evil =
      "&quot;&gt;&lt;img src=x onerror=evil()&gt;&lt;script&gt;window.evil=1&lt;/script&gt;";
  ASSERT_EQ(RunCommand({"publish", "-", "-o", PathOf("hostile")},
                       "<ClashElement ZORDocument='" + evil + "'><ClashResult Name='" + evil +
                           "'><Interference Value='" + evil + "' Status='" + evil +
                           "'><Product Alias='" + evil + "'/><Comment Value='" + evil +
                           "'/></Interference></ClashResult></ClashElement>")
                .code,
            0);
  EXPECT_EQ(After("hostile",
                  "choose('status', document.querySelector('tbody tr').dataset.status);\n"
                  "say([numbers(), document.images.length - 1, "
                  "document.querySelectorAll('main script').length, typeof window.evil, "
                  "document.querySelector('h1').textContent.startsWith('\">"
                  "<img')].join(' '));"),
            "1 0 0 undefined true");  // the one image is that of the dialog
}

TEST_F(Page, NothingIsWiderThanThePage) {
  const std::string word(3000, 'W');
  std::string products;
  for (int i = 0; i < 2; ++i)
    products += "<Product Alias='" + word + "' DescriptionID='x" + word + "'/>";
  ASSERT_EQ(RunCommand({"publish", "-", "-o", PathOf("wide")},
                       "<ClashElement ZORDocument='" + word + "' Responsible='" + word +
                           "'><ClashResult Name='" + word + "'><Interference Name='" + word +
                           "' Value='" + word + "' ResultType='" + word + "' Status='" + word +
                           "'>" + products + "<Comment Value='" + word +
                           "'/></Interference></ClashResult></ClashElement>")
                .code,
            0);
  EXPECT_EQ(After("wide",
                  "say(document.documentElement.scrollWidth <= "
                  "document.documentElement.clientWidth);"),
            "true");
}

TEST_F(Page, PrintHoldsEachInterference) {
  const std::string text = Printed(PathOf("as1/index.html"));
  for (int i = 1; i <= 32; ++i)
    EXPECT_EQ(Occurrences(text, "Interference." + std::to_string(i) + " "), 1u) << i;
  EXPECT_EQ(Occurrences(text, "Search"), 0u);
}

TEST_F(Page, WithoutScriptsAllIsShown) {
  std::string page = Original("dissonance");
  const std::size_t start = page.find("<script"), end = page.find("</script>");
  page.erase(start, end - start);
  directory_->Write("dissonance/still.html", page);
  const std::string text = Printed(PathOf("dissonance/still.html"));
  for (const char* name : {"Clash", "Contact", "Clearance"}) EXPECT_THAT(text, HasSubstr(name));
  const std::string shown = Browse("--dump-dom", PathOf("dissonance/still.html")).out;
  EXPECT_EQ(Occurrences(shown, "<section id=\"i"), 20u);
  EXPECT_EQ(Occurrences(shown, "hidden=\"hidden\""), 1u);  // the filters, which would do nothing
}
