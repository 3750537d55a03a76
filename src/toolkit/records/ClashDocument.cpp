#include "toolkit/records/ClashDocument.h"

#include <algorithm>
#include <cerrno>
#include <climits>
#include <cstring>
#include <new>
#include <optional>
#include <utility>

#include "foundation/ReadWholeFile.h"
#include "platform/xml/ZORXMLParseError.h"
#include "toolkit/records/ElementWalk.h"

namespace ZORToolkit {
namespace {

struct KindName {
  DocumentKind kind;
  const char* rootName;
  const char* description;
};
constexpr KindName kKinds[] = {
    {DocumentKind::kClash, "ClashElement", "a clash document"},
    {DocumentKind::kInterference, "InterferenceElement", "a single-interference document"},
    {DocumentKind::kFederator, "FederatorClashElement", "a federator document"},
    {DocumentKind::kComponents, "Components", "a component list"},
    {DocumentKind::kErrors, "Errors", "an error report"}};

const KindName& WordsOf(DocumentKind inKind) {
  return *std::find_if(std::begin(kKinds), std::end(kKinds),
                       [&](const KindName& inWords) { return inWords.kind == inKind; });
}

/// Raises Error for what is no readable regular file: a pipe might never end, a device neither.
void CheckRegularFile(const std::string& inPath) {
  try {
    ZORFoundation::OpenForReading(inPath);
  } catch (const ZORFoundation::FileError& error) {
    const bool isStream = error.Code() == ESPIPE;
    throw Error(error.Path(),
                error.Reason() + (isStream ? " (what a pipe carries is read as \"-\")" : ""));
  }
}

std::string ReadStandardInput() {
  constexpr int kStandardInput = 0;
  try {
    return ZORFoundation::ReadToEnd(kStandardInput, "-", INT_MAX);
  } catch (const ZORFoundation::FileError& error) {
    throw Error("-", error.Code() == EFBIG ? "is larger than 2 GB" : error.Reason());
  }
}

}  // namespace

const char* RootName(DocumentKind inKind) { return WordsOf(inKind).rootName; }
const char* Description(DocumentKind inKind) { return WordsOf(inKind).description; }

ClashDocument::ClashDocument(const std::string& inPath) : name_(inPath) {
  if (inPath == "-") {
    bytes_ = ReadStandardInput();
    reader_ = std::make_unique<ZORClashParsing>(bytes_.data(), static_cast<int>(bytes_.size()));
  } else {
    CheckRegularFile(inPath);
    reader_ = std::make_unique<ZORClashParsing>(name_.data());
  }
  Load();
}

ClashDocument::ClashDocument(const std::string& inName, std::string inBytes)
    : name_(inName),
      bytes_(std::move(inBytes)),
      reader_(std::make_unique<ZORClashParsing>(bytes_.data(), static_cast<int>(bytes_.size()))) {
  Load();
}

ClashDocument::~ClashDocument() = default;

bool ClashDocument::HasInterferences() const {
  return kind_ == DocumentKind::kClash || kind_ == DocumentKind::kInterference;
}

void ClashDocument::RequireInterferences() const {
  Require({DocumentKind::kClash, DocumentKind::kInterference}, "interferences");
}

void ClashDocument::Load() {
  ZORUnicodeString rootName;
  try {
    // This form of loading hands the tree out; a document without root shows by its missing root.
    reader_->LoadSequence(document_, rootName);
  } catch (const ZORXMLParseError& error) {
    throw Error(name_, error.reason, FilePlace{error.line, error.column});
  } catch (const std::bad_alloc&) {
    throw Error(name_, "there is not enough memory for this document");
  }
  std::string().swap(bytes_);  // an assignment would keep the memory
  if (Root().isNull()) throw Error(name_, "the document is empty");
  for (const KindName& known : kKinds) {
    if (rootName != known.rootName) continue;
    kind_ = known.kind;
    return;
  }
  throw Error(name_,
              std::string("is no clash result: its root element is \"") + Utf8(rootName) + "\"");
}

std::string ClashDocument::Version() const {
  if (kind_ == DocumentKind::kComponents || kind_ == DocumentKind::kErrors) return {};
  const std::string version = AttributeText(Root(), "Version");
  return version.empty() ? "1.1" : version;
}

void ClashDocument::Require(std::initializer_list<DocumentKind> inKinds,
                            const char* inContent) const {
  if (std::find(inKinds.begin(), inKinds.end(), kind_) != inKinds.end()) return;
  throw Error(name_, std::string(Description(kind_)) + " (\"" + RootName(kind_) + "\") has no " +
                         inContent);
}

}  // namespace ZORToolkit
