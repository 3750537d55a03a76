#include "lyra/commands/ReviewInput.h"

#include <unistd.h>

#include <fstream>

#include "foundation/ReadWholeFile.h"
#include "lyra/CommandErrors.h"
#include "lyra/terminal/SafeText.h"
#include "toolkit/records/ClashDocumentEdit.h"

namespace lyra {
using namespace ZORToolkit;
namespace {

constexpr std::uint64_t kMaxSize = 0x7fffffff;  // what the library reads from memory

HRESULT WriteBytes(const std::string& inBytes, const std::string& inPath) {
  std::ofstream file(inPath, std::ios::binary);
  file.write(inBytes.data(), static_cast<std::streamsize>(inBytes.size()));
  return file.flush() ? S_OK : E_FAIL;
}

}  // namespace

std::string BytesOfInput(const std::string& inPath) {
  if (inPath == "-") return ZORFoundation::ReadToEnd(STDIN_FILENO, "-", kMaxSize);
  ZORFoundation::ReadOptions options;
  options.maxSize = kMaxSize;
  return ZORFoundation::ReadWholeFile(inPath, options).bytes;
}

ReviewInput::ReviewInput(const std::string& inPath) : ReviewInput(inPath, BytesOfInput(inPath)) {}

ReviewInput::ReviewInput(const std::string& inPath, std::string inBytes)
    : bytes(std::move(inBytes)), document(inPath, bytes), result(ReadForReview(document)) {}

void WriteReviewed(ReviewInput& ioInput, bool inIsChanged, const std::string& inPath,
                   Output& ioOutput) {
  OutputFile output(inPath);
  if (inIsChanged)
    output.Check(ClashDocumentEdit(ioInput.document).Dump({}, output.Path()));
  else
    output.Check(WriteBytes(ioInput.bytes, output.Path()));
  output.Finish(ioOutput);
}

double LengthOf(const char* inOption, const std::string& inText, double inDefault) {
  if (inText.empty()) return inDefault;
  const std::optional<double> length = Number(inText).value;
  if (!length || *length < 0 || inText.find_first_not_of("0123456789.,eE+-") != std::string::npos)
    throw UsageError(std::string(inOption) + ": \"" + inText + "\" is no length in millimetres");
  return *length;
}

void CompareOptions::Declare(Arguments& ioArguments) {
  ioArguments.Text("--tolerance", "MM", tolerance,
                   "A value or a placement that differs by no more is the same (default: 0.001)");
  ioArguments.Text("--place", "MM", place,
                   "Farther apart on its products it is another interference (default: 10)");
  ioArguments.Language(language);
}

DiffOptions CompareOptions::Get() const {
  DiffOptions options;
  options.tolerance = LengthOf("--tolerance", tolerance, options.tolerance);
  options.samePlace = LengthOf("--place", place, options.samePlace);
  return options;
}

OrderedJson JsonHeader(const char* inName, const OrderedJson& inFilters) {
  return {{"$schema", std::string("urn:zorlyra:schema:").append(inName)},
          {"version", 1},
          {"units", {{"length", "mm"}}},
          {"tool", {{"name", "lyra"}, {"version", LYRA_VERSION}}},
          {"filters", inFilters}};
}

std::string JsonHeaderText(const char* inName) {
  std::string text = JsonLine(JsonHeader(inName));
  text.pop_back();
  return text;
}

std::string JsonLine(const OrderedJson& inJson) {
  return EscapedForJson(inJson.dump(-1, ' ', false, OrderedJson::error_handler_t::replace));
}

}  // namespace lyra
